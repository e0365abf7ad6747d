#include "tarnctl/store/dvports.h"

#include "tarnctl/store/db.h"

namespace TarnCtl::Store::DVPorts {

std::optional<uint32_t> ConnectionId(Db& db, const std::string& dvs, const std::string& portId) {
  auto select = db.Prepare("SELECT connection_id FROM dvport WHERE dvs = ? AND port_id = ?");
  if (!select.Bind(1, dvs).Bind(2, portId).Step()) return std::nullopt;
  return static_cast<uint32_t>(select.Int(0));
}

void Insert(Db& db, const std::string& dvs, const Port& port, int64_t seq) {
  db.Prepare("INSERT INTO dvport(dvs, port_id, connection_id, seq) VALUES (?, ?, ?, ?)")
      .Bind(1, dvs)
      .Bind(2, port.portId)
      .Bind(3, port.connectionId)
      .Bind(4, seq)
      .Run();
}

void SetConnectionId(Db& db, const std::string& dvs, const std::string& portId,
                     uint32_t connectionId) {
  db.Prepare("UPDATE dvport SET connection_id = ? WHERE dvs = ? AND port_id = ?")
      .Bind(1, connectionId)
      .Bind(2, dvs)
      .Bind(3, portId)
      .Run();
}

void Delete(Db& db, const std::string& dvs, const std::string& portId) {
  for (const char* sql : {"DELETE FROM dvport_client WHERE dvs = ? AND port_id = ?",
                          "DELETE FROM dvport WHERE dvs = ? AND port_id = ?"}) {
    db.Prepare(sql).Bind(1, dvs).Bind(2, portId).Run();
  }
}

std::vector<Port> OnSwitch(Db& db, const std::string& dvs) {
  std::vector<Port> ports;
  auto select = db.Prepare("SELECT port_id, connection_id FROM dvport WHERE dvs = ? ORDER BY seq");
  select.Bind(1, dvs);
  while (select.Step()) ports.push_back({select.Text(0), static_cast<uint32_t>(select.Int(1))});
  return ports;
}

int64_t Count(Db& db, const std::string& dvs) {
  auto count = db.Prepare("SELECT count(*) FROM dvport WHERE dvs = ?");
  count.Bind(1, dvs).Step();
  return count.Int(0);
}

std::vector<OnAnySwitch> All(Db& db) {
  std::vector<OnAnySwitch> ports;
  auto select =
      db.Prepare("SELECT dvs, port_id, connection_id FROM dvport ORDER BY seq, dvs, port_id");
  while (select.Step()) {
    ports.push_back({select.Text(0), {select.Text(1), static_cast<uint32_t>(select.Int(2))}});
  }
  return ports;
}

void AddClient(Db& db, const std::string& dvs, const std::string& portId, const std::string& client,
               int64_t seq) {
  db.Prepare("INSERT INTO dvport_client(dvs, port_id, name, seq) VALUES (?, ?, ?, ?)")
      .Bind(1, dvs)
      .Bind(2, portId)
      .Bind(3, client)
      .Bind(4, seq)
      .Run();
}

std::vector<std::string> Clients(Db& db, const std::string& dvs, const std::string& portId) {
  std::vector<std::string> names;
  auto select =
      db.Prepare("SELECT name FROM dvport_client WHERE dvs = ? AND port_id = ? ORDER BY seq");
  select.Bind(1, dvs).Bind(2, portId);
  while (select.Step()) names.push_back(select.Text(0));
  return names;
}

void AddEvent(Db& db, const std::string& dvs, const std::string& portId, const std::string& kind,
              int64_t seq) {
  db.Prepare("INSERT INTO dvport_event(seq, dvs, port_id, kind) VALUES (?, ?, ?, ?)")
      .Bind(1, seq)
      .Bind(2, dvs)
      .Bind(3, portId)
      .Bind(4, kind)
      .Run();
}

}  // namespace TarnCtl::Store::DVPorts
