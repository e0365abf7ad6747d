// Distributed switches, added as their management plane would add them and
// removed from the running state and the cache with their DVPorts; one
// reading of them in a layer, printed as text, JSON and rows.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "tarnctl/admin/view.h"
#include "tarnctl/model/limits.h"
#include "tarnctl/store/distributed.h"
#include "tarnctl/store/layer.h"

namespace TarnCtl::Admin {

struct DVSwitch {
  std::string name;
  Store::Distributed::Row row;
  std::vector<Store::Distributed::Uplink> uplinks;
};

struct DVSwitchSeed {
  std::string name;
  std::optional<std::string> portset;   // default: the name
  std::optional<std::string> switchId;  // default: derived from the name, unique
  int32_t ports = Model::kDefaultPorts;
  uint32_t mtu = Model::kDefaultMtu;
  std::vector<std::string> uplinks;  // pnics, must be free
};

// The distributed switches of `layer` in creation order; one of them.
std::vector<DVSwitch> DVSwitches(Store::Db& db, Store::Layer layer);
std::optional<DVSwitch> FindDVSwitch(Store::Db& db, Store::Layer layer, const std::string& name);

void AddDVSwitch(Store::Db& db, const DVSwitchSeed& seed);
void RemoveDVSwitch(Store::Db& db, const std::string& name);

// Running: name, portset, switch id, ports, used ports, uplinks.
std::vector<ListRow> ListDVSwitches(Store::Db& db);

std::string DVSwitchText(const DVSwitch& dvs);
Json DVSwitchJson(const DVSwitch& dvs);

}  // namespace TarnCtl::Admin
