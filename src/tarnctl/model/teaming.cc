#include "tarnctl/model/teaming.h"

#include <set>
#include <string>

#include "tarnctl/instrument/errors.h"
#include "tarnctl/model/limits.h"
#include "tarnctl/model/names.h"

namespace TarnCtl::Model {

using HostCtl::Network::NicTeamingPolicy;

void CheckTeamingPolicy(const NicTeamingPolicy& policy) {
  Check(kMaxActive, policy.maxActive);
  std::set<std::string> seen;
  for (const std::string& uplink : policy.uplinkOrder) {
    CheckName(NameKind::kUplink, uplink);
    if (!seen.insert(uplink).second) {
      throw Instrument::Refused("Uplink " + uplink + " appears twice in the teaming order");
    }
  }
}

NicTeamingPolicy NewPortGroupPolicy() {
  return {};
}

NicTeamingPolicy DefaultTeamingPolicy() {
  NicTeamingPolicy policy;
  policy.flags = NicTeamingPolicy::kUplinkOrderSet;
  return policy;
}

}  // namespace TarnCtl::Model
