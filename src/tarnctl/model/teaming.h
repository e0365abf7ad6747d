// Teaming policies: what a policy must be before it is stored, and the
// policies new objects start with.
#pragma once

#include "hostctl/records.h"

namespace TarnCtl::Model {

// Refuses a policy whose active count is negative or whose uplink order
// names a pnic twice or holds a name that breaks the uplink name rule.
// Names that are not linked are fine (standby uplinks).
void CheckTeamingPolicy(const HostCtl::Network::NicTeamingPolicy& policy);

// A new port group's policy: no uplink order of its own.
HostCtl::Network::NicTeamingPolicy NewPortGroupPolicy();
// The library's default policy (GetDefaultPolicy), which a new system
// switch starts with: an explicit, empty uplink order.
HostCtl::Network::NicTeamingPolicy DefaultTeamingPolicy();

}  // namespace TarnCtl::Model
