// Opaque switches: switches of another control plane that hold a portset
// and pnics; one reading, printed as text, JSON and rows.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "tarnctl/admin/view.h"
#include "tarnctl/model/limits.h"
#include "tarnctl/store/opaque.h"

namespace TarnCtl::Admin {

using OpaqueSwitch = Store::Opaque::Named;

struct OpaqueSeed {
  std::string name;
  std::optional<std::string> portset;  // default: the name
  int32_t ports = Model::kDefaultPorts;
  int32_t used = 0;
  std::vector<std::string> uplinks;
};

// Every opaque switch, in creation order; the one of a name.
std::vector<OpaqueSwitch> OpaqueSwitches(Store::Db& db);
std::optional<OpaqueSwitch> FindOpaqueSwitch(Store::Db& db, const std::string& name);

void AddOpaqueSwitch(Store::Db& db, const OpaqueSeed& seed);
void RemoveOpaqueSwitch(Store::Db& db, const std::string& name);

// Name, portset, ports, used ports, uplinks.
std::vector<ListRow> ListOpaqueSwitches(Store::Db& db);

std::string OpaqueSwitchText(const OpaqueSwitch& sw);
Json OpaqueSwitchJson(const OpaqueSwitch& sw);

}  // namespace TarnCtl::Admin
