// Distributed switches (table dvswitch) and their uplinks (table
// dvs_uplink). The stored layer is the distributed switch cache.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "tarnctl/store/layer.h"

namespace TarnCtl::Store {
class Db;
}

namespace TarnCtl::Store::Distributed {

struct Row {
  std::string portset;
  std::string switchId;
  std::string uuid;
  std::string implClass;
  int32_t version = 0;
  uint32_t numPorts = 0;
  uint32_t mtu = 0;

  bool operator==(const Row&) const = default;
};

struct Named {
  std::string name;
  Row row;
};

struct Uplink {
  std::string pnic;
  std::optional<std::string> portId;  // the DVPort it was added to

  bool operator==(const Uplink&) const = default;
};

std::optional<Row> Find(Db& db, Layer layer, const std::string& name);
// The switch of `layer` whose switch id or portset name this is.
std::optional<std::string> NameOfSwitchId(Db& db, Layer layer, const std::string& switchId);
std::optional<std::string> NameOfPortset(Db& db, Layer layer, const std::string& portset);
void Insert(Db& db, Layer layer, const std::string& name, int64_t seq, const Row& row);
// In the order they were made.
std::vector<Named> List(Db& db, Layer layer);
// Drops the cache entries (and their uplinks) that share a name, portset
// name or switch id with a new switch.
void DeleteCachedClashes(Db& db, const std::string& name, const std::string& portset,
                         const std::string& switchId);
// Drops the switch from both layers with its uplinks, DVPorts and ENS.
void Delete(Db& db, const std::string& name, const std::string& portset);
// In both layers.
void SetMtu(Db& db, const std::string& name, uint32_t mtu);

// DVPorts with at least one client.
int64_t PortsInUse(Db& db, const std::string& name);
// Running uplinks plus PortsInUse.
int64_t UsedPorts(Db& db, const std::string& name);

// Uplinks.
void AddUplink(Db& db, Layer layer, const std::string& name, const Uplink& uplink, int64_t seq);
bool HasUplink(Db& db, Layer layer, const std::string& name, const std::string& pnic);
// From both layers.
void RemoveUplink(Db& db, const std::string& name, const std::string& pnic);
// In the order they were added.
std::vector<Uplink> Uplinks(Db& db, Layer layer, const std::string& name);

}  // namespace TarnCtl::Store::Distributed
