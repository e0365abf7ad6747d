// Port groups of standard switches (table portgroup) and the clients on
// them (table client). Port group names are unique per layer on the whole
// host; clients are not layered and belong to the port group of their
// port group's name whenever it exists.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "tarnctl/store/layer.h"

namespace TarnCtl::Store {
class Db;
}

namespace TarnCtl::Store::PortGroups {

struct Row {
  std::string switchName;
  uint16_t vlan = 0;
  std::string policy;   // policy_codec.h, stored form
  int64_t clients = 0;  // read only: the clients on the port group

  bool operator==(const Row&) const = default;
};

struct Named {
  std::string name;
  Row row;
};

std::optional<Row> Find(Db& db, Layer layer, const std::string& name);
bool Exists(Db& db, Layer layer, const std::string& name);
void Insert(Db& db, Layer layer, const std::string& name, int64_t seq, const Row& row);
// The port groups of a switch in `layer`, in the order they were added.
std::vector<Named> OnSwitch(Db& db, Layer layer, const std::string& switchName);
std::vector<std::string> Names(Db& db, Layer layer);

// In both layers (whichever switch holds the name there).
void SetVlan(Db& db, const std::string& name, uint16_t vlan);
void SetPolicy(Db& db, const std::string& name, const std::string& policy);
// The port group `name` of the switch `switchName`, in both layers.
void Delete(Db& db, const std::string& name, const std::string& switchName);

// Clients.
bool HasClient(Db& db, const std::string& portGroup, const std::string& client);
void AddClient(Db& db, const std::string& portGroup, const std::string& client, int64_t seq);
void RemoveClient(Db& db, const std::string& portGroup, const std::string& client);
int64_t ClientCount(Db& db, const std::string& portGroup);
// In the order they were added.
std::vector<std::string> Clients(Db& db, const std::string& portGroup);
struct Client {
  std::string portGroup;
  std::string name;
};
// Every client of the host, of existing port groups or not, in the order
// they were added.
std::vector<Client> AllClients(Db& db);

}  // namespace TarnCtl::Store::PortGroups
