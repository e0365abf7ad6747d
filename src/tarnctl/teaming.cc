#include "tarnctl/teaming.h"

#include <set>

#include "tarnctl/errors.h"

namespace TarnCtl::Detail {

void CheckTeamingPolicy(const HostCtl::Network::NicTeamingPolicy& policy) {
  if (policy.maxActive < 0) {
    throw Refused("Invalid max active uplinks " + std::to_string(policy.maxActive),
                  "(it must be 0 or more)");
  }
  std::set<std::string> seen;
  for (const std::string& uplink : policy.uplinkOrder) {
    if (!seen.insert(uplink).second) {
      throw Refused("Uplink " + uplink + " appears twice in the teaming order");
    }
  }
}

HostCtl::Network::NicTeamingPolicy NewPortGroupPolicy() {
  return {};
}

}  // namespace TarnCtl::Detail
