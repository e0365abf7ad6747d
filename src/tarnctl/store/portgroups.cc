#include "tarnctl/store/portgroups.h"

#include "tarnctl/store/db.h"

namespace TarnCtl::Store::PortGroups {

std::optional<Row> Find(Db& db, Layer layer, const std::string& name) {
  auto select =
      Keyed(db,
            "SELECT switch, vlan, policy, (SELECT count(*) FROM client WHERE portgroup = ?2)"
            " FROM portgroup WHERE layer = ?1 AND name = ?2",
            LayerValue(layer), name);
  if (!select.Step()) return std::nullopt;
  return Row{select.Text(0), static_cast<uint16_t>(select.Int(1)), select.Text(2), select.Int(3)};
}

bool Exists(Db& db, Layer layer, const std::string& name) {
  return Keyed(db, "SELECT 1 FROM portgroup WHERE layer = ?1 AND name = ?2", LayerValue(layer),
               name)
      .Step();
}

void Insert(Db& db, Layer layer, const std::string& name, int64_t seq, const Row& row) {
  db.Prepare(
        "INSERT INTO portgroup(layer, name, switch, seq, vlan, policy)"
        " VALUES (?, ?, ?, ?, ?, ?)")
      .Bind(1, LayerValue(layer))
      .Bind(2, name)
      .Bind(3, row.switchName)
      .Bind(4, seq)
      .Bind(5, row.vlan)
      .Bind(6, row.policy)
      .Run();
}

// A row for each client of a port group, one with no client for one that
// has none: a join costs less than counting each port group's clients in a
// subquery of its own (a cursor opened and an aggregate run per row).
std::vector<Named> OnSwitch(Db& db, Layer layer, const std::string& switchName) {
  std::vector<Named> groups;
  auto select = db.Prepare(
      "SELECT p.name, p.vlan, p.policy, c.name IS NOT NULL FROM portgroup p"
      " LEFT JOIN client c ON c.portgroup = p.name"
      " WHERE p.layer = ? AND p.switch = ? ORDER BY p.seq");
  select.Bind(1, LayerValue(layer)).Bind(2, switchName);
  while (select.Step()) {
    std::string name = select.Text(0);
    if (groups.empty() || groups.back().name != name) {
      groups.push_back(
          {std::move(name), {switchName, static_cast<uint16_t>(select.Int(1)), select.Text(2), 0}});
    }
    groups.back().row.clients += select.Int(3);
  }
  return groups;
}

std::vector<std::string> Names(Db& db, Layer layer) {
  std::vector<std::string> names;
  auto select = db.Prepare("SELECT name FROM portgroup WHERE layer = ?");
  select.Bind(1, LayerValue(layer));
  while (select.Step()) names.push_back(select.Text(0));
  return names;
}

void SetVlan(Db& db, const std::string& name, uint16_t vlan) {
  db.Prepare("UPDATE portgroup SET vlan = ? WHERE layer IN (0, 1) AND name = ?")
      .Bind(1, vlan)
      .Bind(2, name)
      .Run();
}

void SetPolicy(Db& db, const std::string& name, const std::string& policy) {
  db.Prepare("UPDATE portgroup SET policy = ? WHERE layer IN (0, 1) AND name = ?")
      .Bind(1, policy)
      .Bind(2, name)
      .Run();
}

void Delete(Db& db, const std::string& name, const std::string& switchName) {
  db.Prepare("DELETE FROM portgroup WHERE layer IN (0, 1) AND name = ? AND switch = ?")
      .Bind(1, name)
      .Bind(2, switchName)
      .Run();
}

bool HasClient(Db& db, const std::string& portGroup, const std::string& client) {
  return db.Prepare("SELECT 1 FROM client WHERE portgroup = ? AND name = ?")
      .Bind(1, portGroup)
      .Bind(2, client)
      .Step();
}

void AddClient(Db& db, const std::string& portGroup, const std::string& client, int64_t seq) {
  db.Prepare("INSERT INTO client(portgroup, name, seq) VALUES (?, ?, ?)")
      .Bind(1, portGroup)
      .Bind(2, client)
      .Bind(3, seq)
      .Run();
}

void RemoveClient(Db& db, const std::string& portGroup, const std::string& client) {
  db.Prepare("DELETE FROM client WHERE portgroup = ? AND name = ?")
      .Bind(1, portGroup)
      .Bind(2, client)
      .Run();
}

int64_t ClientCount(Db& db, const std::string& portGroup) {
  auto count = db.Prepare("SELECT count(*) FROM client WHERE portgroup = ?");
  count.Bind(1, portGroup).Step();
  return count.Int(0);
}

std::vector<std::string> Clients(Db& db, const std::string& portGroup) {
  std::vector<std::string> names;
  auto select = db.Prepare("SELECT name FROM client WHERE portgroup = ? ORDER BY seq");
  select.Bind(1, portGroup);
  while (select.Step()) names.push_back(select.Text(0));
  return names;
}

std::vector<Client> AllClients(Db& db) {
  std::vector<Client> clients;
  auto select = db.Prepare("SELECT portgroup, name FROM client ORDER BY seq, portgroup, name");
  while (select.Step()) clients.push_back({select.Text(0), select.Text(1)});
  return clients;
}

}  // namespace TarnCtl::Store::PortGroups
