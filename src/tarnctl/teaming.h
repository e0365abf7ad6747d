// The checks a teaming policy passes before it is stored: maxActive is 0 or
// more, and the uplink order names no pnic twice. Names that are not linked
// are allowed (standby uplinks). Refusals are HostCtlExceptions of the
// running operation.
#pragma once

#include "hostctl/records.h"

namespace TarnCtl::Detail {

void CheckTeamingPolicy(const HostCtl::Network::NicTeamingPolicy& policy);

// The stored policy of a new port group: no uplink order of its own.
HostCtl::Network::NicTeamingPolicy NewPortGroupPolicy();

}  // namespace TarnCtl::Detail
