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
// A system switch's policy: an explicit, empty uplink order.
HostCtl::Network::NicTeamingPolicy NewSystemSwitchPolicy();

}  // namespace TarnCtl::Model
