// -L, -U, -M and -N: uplinks of a standard switch and of its port groups,
// and the two edits of a teaming policy's failover order they share.
#include <algorithm>
#include <iostream>
#include <memory>
#include <vector>

#include "commands/commands.h"
#include "hostctl/exception.h"
#include "hostctl/tarnctl.h"

namespace Commands {

using HostCtl::Lib::HostCtlException;
using HostCtl::Network::NicTeamingPolicy;

namespace {

// The failover order the policy carries; none when its order is not set.
std::vector<std::string> ExplicitOrder(const NicTeamingPolicy& policy) {
  if ((policy.flags & NicTeamingPolicy::kUplinkOrderSet) == 0) return {};
  return policy.uplinkOrder;
}

}  // namespace

// The uplink becomes the last active one: it goes right behind the first
// maxActive entries (or at the end when there are fewer) and the active
// count then covers it. A negative count inserts at the front.
bool AddUplinkToTeaming(const std::string& uplink, NicTeamingPolicy& policy) {
  std::vector<std::string> order = ExplicitOrder(policy);
  if (std::find(order.begin(), order.end(), uplink) != order.end()) return false;
  const auto length = static_cast<int64_t>(order.size());
  const int64_t index = std::clamp<int64_t>(policy.maxActive, 0, length);
  order.insert(order.begin() + index, uplink);
  policy.SetUplinkOrder(order);
  policy.SetMaxActiveUplinks(static_cast<int>(index + 1));
  return true;
}

// Removes the uplink; the active count shrinks only when it was active.
bool RemoveUplinkFromTeaming(const std::string& uplink, NicTeamingPolicy& policy) {
  if ((policy.flags & NicTeamingPolicy::kUplinkOrderSet) == 0) return false;
  std::vector<std::string> order = policy.uplinkOrder;
  const auto found = std::find(order.begin(), order.end(), uplink);
  if (found == order.end()) {
    std::cerr << "Not a valid pnic: " << uplink << std::endl;
    return false;
  }
  const int64_t index = found - order.begin();
  const int32_t active = policy.maxActive;
  order.erase(found);
  policy.SetUplinkOrder(order);
  if (index < active) policy.SetMaxActiveUplinks(active - 1);
  return true;
}

// The pnic is linked before the edited policy is stored; on failure the
// policy as first read is written back, but a link already made stays.
int LinkPnic(HostCtl::Network::VirtualSwitch& sw, std::string pnic) {
  const NicTeamingPolicy saved = sw.GetTeamingPolicy();
  try {
    NicTeamingPolicy working = sw.GetTeamingPolicy();
    const bool changed = AddUplinkToTeaming(pnic, working);
    sw.AddUplink(pnic, true);
    if (changed) sw.SetTeamingPolicy(working);
    return 0;
  } catch (const HostCtlException& e) {
    sw.SetTeamingPolicy(saved);
    std::cerr << "Failed to add uplink " << pnic << " to vswitch " << sw.GetName()
              << ", Error: " << e.GetMessage() << std::endl;
    return 1;
  }
}

// When the running switch refuses, the pnic is still taken out of the
// stored configuration, so that it is not linked again at the next boot.
int UnlinkPnic(HostCtl::Network::VirtualSwitch& sw, std::string pnic) {
  try {
    NicTeamingPolicy policy = sw.GetTeamingPolicy();
    if (RemoveUplinkFromTeaming(pnic, policy)) sw.SetTeamingPolicy(policy);
    sw.RemoveUplink(pnic, false);
  } catch (const HostCtlException&) {
    std::cerr << "Removing from config file only" << std::endl;
    sw.RemoveUplink(pnic, true);
  }
  return 0;
}

void CheckKnownPortGroup(const std::string& portGroup) {
  if (!TarnCtl::Network::PortGroupImpl::IsValidPortGroup(portGroup)) {
    throw Failure{1, "Unknown portgroup " + portGroup};
  }
}

void EditPortgroupUplinks(HostCtl::Network::VirtualSwitch& sw, const std::string& switchName,
                          const std::string& portGroup, const std::string& uplink, bool add) {
  const std::vector<std::string> switchUplinks = OrEndWithMessage([&] { return sw.GetUplinks(); });
  auto groups = OrEndWithMessage([&] { return sw.GetPortGroups(); });

  const bool onSwitch = std::any_of(groups.begin(), groups.end(), [&](const auto& group) {
    return group->GetName() == portGroup;
  });
  groups.clear();
  if (!onSwitch) {
    throw Failure{1, "Portgroup (" + portGroup + ") does not exist on switch: " + switchName};
  }

  TarnCtl::Network::PortGroupImpl group(portGroup);
  NicTeamingPolicy policy = group.GetTeamingPolicy();
  if (add) {
    if (std::find(switchUplinks.begin(), switchUplinks.end(), uplink) == switchUplinks.end()) {
      throw Failure{1, "Uplink (" + uplink + ") does not exist on the switch: " + switchName};
    }
    AddUplinkToTeaming(uplink, policy);
  } else {
    RemoveUplinkFromTeaming(uplink, policy);
  }
  group.SetTeamingPolicy(policy);
}

}  // namespace Commands
