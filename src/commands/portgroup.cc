// -A, -D and -v: port groups of a standard switch.
#include <iostream>

#include "cli/usage.h"
#include "commands/commands.h"
#include "hostctl/exception.h"

namespace Commands {

using HostCtl::Lib::HostCtlException;

int AddPortgroup(HostCtl::Network::VirtualSwitch& sw, std::string portGroup) {
  try {
    sw.AddPortGroup(portGroup);
    return 0;
  } catch (const HostCtlException& e) {
    std::cerr << "Failed to add portgroup: " << portGroup << " to vswitch: " << sw.GetName()
              << ", Error: " << e.GetMessage() << std::endl;
    return 1;
  }
}

int DeletePortgroup(HostCtl::Network::VirtualSwitch& sw, std::string portGroup) {
  try {
    sw.RemovePortGroup(portGroup);
    return 0;
  } catch (const HostCtlException& e) {
    std::cerr << "Failed to remove portgroup: " << portGroup << ", Error: " << e.GetMessage()
              << std::endl;
    return 1;
  }
}

// Sets the VLAN on every port group that bears the name (or on all of them
// for "ALL"). A refusal is reported and the walk goes on: the status tells
// whether any port group kept its old VLAN.
int SetPortgroupVlan(HostCtl::Network::VirtualSwitch& sw, std::string portGroup, uint32_t vlanId) {
  const bool all = portGroup == Cli::kAllPortGroups;
  bool found = false;
  int status = 0;
  for (const auto& group : sw.GetPortGroups()) {
    if (!all && group->GetName() != portGroup) continue;
    found = true;
    try {
      group->SetVlanId(static_cast<uint16_t>(vlanId));
    } catch (const HostCtlException& e) {
      std::cerr << "Set vlan id to " << vlanId << " failed for " << group->GetName()
                << ", Error: " << e.GetMessage() << std::endl;
      status = 1;
    }
  }
  if (!found && !all) {
    std::cerr << "No such portgroup: " << portGroup << " under vswitch: " << sw.GetName()
              << std::endl;
    return 1;
  }
  return status;
}

}  // namespace Commands
