#include "tarnctl/store/distributed.h"

#include "tarnctl/store/db.h"

namespace TarnCtl::Store::Distributed {

namespace {

constexpr const char* kRowColumns = "portset, switch_id, uuid, impl_class, version, num_ports, mtu";

Row ReadRow(const Statement& select, int first) {
  return {select.Text(first),
          select.Text(first + 1),
          select.Text(first + 2),
          select.Text(first + 3),
          static_cast<int32_t>(select.Int(first + 4)),
          static_cast<uint32_t>(select.Int(first + 5)),
          static_cast<uint32_t>(select.Int(first + 6))};
}

std::optional<std::string> NameWhere(Db& db, const char* sql, Layer layer,
                                     const std::string& value) {
  auto select = Keyed(db, sql, LayerValue(layer), value);
  if (!select.Step()) return std::nullopt;
  return select.Text(0);
}

}  // namespace

std::optional<Row> Find(Db& db, Layer layer, const std::string& name) {
  auto select = Keyed(
      db, std::string("SELECT ") + kRowColumns + " FROM dvswitch WHERE layer = ?1 AND name = ?2",
      LayerValue(layer), name);
  if (!select.Step()) return std::nullopt;
  return ReadRow(select, 0);
}

std::optional<std::string> NameOfSwitchId(Db& db, Layer layer, const std::string& switchId) {
  return NameWhere(db, "SELECT name FROM dvswitch WHERE layer = ? AND switch_id = ?", layer,
                   switchId);
}

std::optional<std::string> NameOfPortset(Db& db, Layer layer, const std::string& portset) {
  return NameWhere(db, "SELECT name FROM dvswitch WHERE layer = ? AND portset = ?", layer, portset);
}

void Insert(Db& db, Layer layer, const std::string& name, int64_t seq, const Row& row) {
  db.Prepare(
        "INSERT INTO dvswitch(layer, name, portset, switch_id, uuid, impl_class, version,"
        " num_ports, mtu, seq) VALUES (?, ?, ?, ?, ?, ?, ?, ?, ?, ?)")
      .Bind(1, LayerValue(layer))
      .Bind(2, name)
      .Bind(3, row.portset)
      .Bind(4, row.switchId)
      .Bind(5, row.uuid)
      .Bind(6, row.implClass)
      .Bind(7, row.version)
      .Bind(8, row.numPorts)
      .Bind(9, row.mtu)
      .Bind(10, seq)
      .Run();
}

std::vector<Named> List(Db& db, Layer layer) {
  std::vector<Named> switches;
  auto select = db.Prepare(std::string("SELECT name, ") + kRowColumns +
                           " FROM dvswitch WHERE layer = ? ORDER BY seq, name");
  select.Bind(1, LayerValue(layer));
  while (select.Step()) switches.push_back({select.Text(0), ReadRow(select, 1)});
  return switches;
}

void DeleteCachedClashes(Db& db, const std::string& name, const std::string& portset,
                         const std::string& switchId) {
  for (const char* sql :
       {"DELETE FROM dvs_uplink WHERE layer = 0 AND dvs IN (SELECT name FROM dvswitch"
        " WHERE layer = 0 AND (name IN (?1, ?2) OR portset IN (?1, ?2) OR switch_id = ?3))",
        "DELETE FROM dvswitch WHERE layer = 0"
        " AND (name IN (?1, ?2) OR portset IN (?1, ?2) OR switch_id = ?3)"}) {
    db.Prepare(sql).Bind(1, name).Bind(2, portset).Bind(3, switchId).Run();
  }
}

void Delete(Db& db, const std::string& name, const std::string& portset) {
  for (const char* sql : {"DELETE FROM dvswitch WHERE layer IN (0, 1) AND name = ?",
                          "DELETE FROM dvs_uplink WHERE layer IN (0, 1) AND dvs = ?",
                          "DELETE FROM dvport WHERE dvs = ?"}) {
    db.Prepare(sql).Bind(1, name).Run();
  }
  db.Prepare("DELETE FROM ens WHERE portset = ?").Bind(1, portset).Run();
}

void SetMtu(Db& db, const std::string& name, uint32_t mtu) {
  db.Prepare("UPDATE dvswitch SET mtu = ? WHERE layer IN (0, 1) AND name = ?")
      .Bind(1, mtu)
      .Bind(2, name)
      .Run();
}

int64_t PortsInUse(Db& db, const std::string& name) {
  auto count = db.Prepare("SELECT count(DISTINCT port_id) FROM dvport_client WHERE dvs = ?");
  count.Bind(1, name).Step();
  return count.Int(0);
}

int64_t UsedPorts(Db& db, const std::string& name) {
  auto count = db.Prepare("SELECT count(*) FROM dvs_uplink WHERE layer = 1 AND dvs = ?");
  count.Bind(1, name).Step();
  return count.Int(0) + PortsInUse(db, name);
}

void AddUplink(Db& db, Layer layer, const std::string& name, const Uplink& uplink, int64_t seq) {
  auto insert = db.Prepare(
      "INSERT OR REPLACE INTO dvs_uplink(layer, pnic, dvs, port_id, seq) VALUES (?, ?, ?, ?, ?)");
  insert.Bind(1, LayerValue(layer)).Bind(2, uplink.pnic).Bind(3, name).Bind(5, seq);
  if (uplink.portId) {
    insert.Bind(4, *uplink.portId);
  } else {
    insert.BindNull(4);
  }
  insert.Run();
}

bool HasUplink(Db& db, Layer layer, const std::string& name, const std::string& pnic) {
  return db.Prepare("SELECT 1 FROM dvs_uplink WHERE layer = ? AND pnic = ? AND dvs = ?")
      .Bind(1, LayerValue(layer))
      .Bind(2, pnic)
      .Bind(3, name)
      .Step();
}

void RemoveUplink(Db& db, const std::string& name, const std::string& pnic) {
  db.Prepare("DELETE FROM dvs_uplink WHERE layer IN (0, 1) AND pnic = ? AND dvs = ?")
      .Bind(1, pnic)
      .Bind(2, name)
      .Run();
}

std::vector<Uplink> Uplinks(Db& db, Layer layer, const std::string& name) {
  std::vector<Uplink> uplinks;
  auto select = db.Prepare(
      "SELECT pnic, port_id FROM dvs_uplink WHERE layer = ? AND dvs = ? ORDER BY seq, pnic");
  select.Bind(1, LayerValue(layer)).Bind(2, name);
  while (select.Step()) {
    Uplink uplink{select.Text(0), std::nullopt};
    if (!select.IsNull(1)) uplink.portId = select.Text(1);
    uplinks.push_back(std::move(uplink));
  }
  return uplinks;
}

}  // namespace TarnCtl::Store::Distributed
