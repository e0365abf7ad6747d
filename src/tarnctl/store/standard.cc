#include "tarnctl/store/standard.h"

#include "tarnctl/store/db.h"

namespace TarnCtl::Store::Standard {

namespace {

constexpr const char* kRowColumns = "num_ports, mtu, cdp, system, policy";

Row ReadRow(const Statement& select, int first) {
  Row row;
  row.numPorts = static_cast<uint32_t>(select.Int(first));
  row.mtu = static_cast<uint32_t>(select.Int(first + 1));
  row.cdp = static_cast<int32_t>(select.Int(first + 2));
  row.system = select.Int(first + 3) != 0;
  row.policy = select.Text(first + 4);
  return row;
}

std::vector<Named> ReadNamed(Statement& select) {
  std::vector<Named> switches;
  while (select.Step()) switches.push_back({select.Text(0), ReadRow(select, 1)});
  return switches;
}

}  // namespace

std::optional<Row> Find(Db& db, Layer layer, const std::string& name) {
  auto select = Keyed(
      db, std::string("SELECT ") + kRowColumns + " FROM vswitch WHERE layer = ?1 AND name = ?2",
      LayerValue(layer), name);
  if (!select.Step()) return std::nullopt;
  return ReadRow(select, 0);
}

bool Exists(Db& db, Layer layer, const std::string& name) {
  return Keyed(db, "SELECT 1 FROM vswitch WHERE layer = ?1 AND name = ?2", LayerValue(layer), name)
      .Step();
}

void Insert(Db& db, Layer layer, const std::string& name, int64_t seq, const Row& row) {
  db.Prepare(
        "INSERT INTO vswitch(layer, name, seq, num_ports, mtu, cdp, system, policy)"
        " VALUES (?, ?, ?, ?, ?, ?, ?, ?)")
      .Bind(1, LayerValue(layer))
      .Bind(2, name)
      .Bind(3, seq)
      .Bind(4, row.numPorts)
      .Bind(5, row.mtu)
      .Bind(6, row.cdp)
      .Bind(7, row.system ? 1 : 0)
      .Bind(8, row.policy)
      .Run();
}

std::vector<Named> List(Db& db, Layer layer, bool system) {
  auto select = db.Prepare(std::string("SELECT name, ") + kRowColumns +
                           " FROM vswitch WHERE layer = ? AND system = ? ORDER BY seq");
  select.Bind(1, LayerValue(layer)).Bind(2, system ? 1 : 0);
  return ReadNamed(select);
}

std::vector<Named> ListAll(Db& db, Layer layer) {
  auto select = db.Prepare(std::string("SELECT name, ") + kRowColumns +
                           " FROM vswitch WHERE layer = ? ORDER BY seq, name");
  select.Bind(1, LayerValue(layer));
  return ReadNamed(select);
}

void SetPolicy(Db& db, const std::string& name, const std::string& policy) {
  db.Prepare("UPDATE vswitch SET policy = ? WHERE layer IN (0, 1) AND name = ?")
      .Bind(1, policy)
      .Bind(2, name)
      .Run();
}

void SetCdp(Db& db, const std::string& name, int32_t cdp) {
  db.Prepare("UPDATE vswitch SET cdp = ? WHERE layer IN (0, 1) AND name = ?")
      .Bind(1, cdp)
      .Bind(2, name)
      .Run();
}

void SetMtu(Db& db, const std::string& name, uint32_t mtu) {
  db.Prepare("UPDATE vswitch SET mtu = ? WHERE layer IN (0, 1) AND name = ?")
      .Bind(1, mtu)
      .Bind(2, name)
      .Run();
}

void DeleteStored(Db& db, const std::string& name) {
  for (const char* sql : {"DELETE FROM vswitch WHERE layer = 0 AND name = ?",
                          "DELETE FROM portgroup WHERE layer = 0 AND switch = ?",
                          "DELETE FROM link WHERE layer = 0 AND switch = ?"}) {
    db.Prepare(sql).Bind(1, name).Run();
  }
}

void Delete(Db& db, const std::string& name) {
  for (const char* sql : {"DELETE FROM vswitch WHERE layer IN (0, 1) AND name = ?",
                          "DELETE FROM portgroup WHERE layer IN (0, 1) AND switch = ?",
                          "DELETE FROM link WHERE layer IN (0, 1) AND switch = ?",
                          "DELETE FROM ens WHERE portset = ?"}) {
    db.Prepare(sql).Bind(1, name).Run();
  }
}

int64_t ClientCount(Db& db, const std::string& name) {
  auto count = db.Prepare(
      "SELECT count(*) FROM portgroup p JOIN client c ON c.portgroup = p.name"
      " WHERE p.layer = 1 AND p.switch = ?");
  count.Bind(1, name).Step();
  return count.Int(0);
}

int64_t UsedPorts(Db& db, const std::string& name) {
  auto count = db.Prepare("SELECT count(*) FROM link WHERE layer = 1 AND switch = ?");
  count.Bind(1, name).Step();
  return count.Int(0) + ClientCount(db, name);
}

bool Linked(Db& db, Layer layer, const std::string& pnic, const std::string& name) {
  return db.Prepare("SELECT 1 FROM link WHERE layer = ? AND pnic = ? AND switch = ?")
      .Bind(1, LayerValue(layer))
      .Bind(2, pnic)
      .Bind(3, name)
      .Step();
}

void Link(Db& db, Layer layer, const std::string& pnic, const std::string& name, int64_t seq) {
  db.Prepare("INSERT OR REPLACE INTO link(layer, pnic, switch, seq) VALUES (?, ?, ?, ?)")
      .Bind(1, LayerValue(layer))
      .Bind(2, pnic)
      .Bind(3, name)
      .Bind(4, seq)
      .Run();
}

void Unlink(Db& db, const std::string& pnic, const std::string& name, bool storedOnly) {
  db.Prepare("DELETE FROM link WHERE layer IN (0, ?) AND pnic = ? AND switch = ?")
      .Bind(1, storedOnly ? 0 : 1)
      .Bind(2, pnic)
      .Bind(3, name)
      .Run();
}

std::vector<std::string> Uplinks(Db& db, Layer layer, const std::string& name) {
  std::vector<std::string> uplinks;
  auto select = db.Prepare("SELECT pnic FROM link WHERE layer = ? AND switch = ? ORDER BY seq");
  select.Bind(1, LayerValue(layer)).Bind(2, name);
  while (select.Step()) uplinks.push_back(select.Text(0));
  return uplinks;
}

std::vector<std::pair<std::string, int64_t>> UnrestoredLinks(Db& db, const std::string& name) {
  std::vector<std::pair<std::string, int64_t>> links;
  auto select = db.Prepare(
      "SELECT s.pnic, s.seq FROM link s WHERE s.layer = 0 AND s.switch = ?1 AND NOT EXISTS"
      " (SELECT 1 FROM link r WHERE r.layer = 1 AND r.pnic = s.pnic AND r.switch = ?1)"
      " ORDER BY s.seq");
  select.Bind(1, name);
  while (select.Step()) links.emplace_back(select.Text(0), select.Int(1));
  return links;
}

}  // namespace TarnCtl::Store::Standard
