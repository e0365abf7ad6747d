// -a and -d on standard switches: creation with the default policies, and
// removal after the admission check.
#include <iostream>

#include "commands/commands.h"
#include "hostctl/exception.h"
#include "hostctl/tarnctl.h"

namespace Commands {

using HostCtl::Lib::HostCtlException;
using HostCtl::Network::NicCapabilities;
using HostCtl::Network::NicTeamingPolicy;
using HostCtl::Network::PortSecurityPolicy;
using HostCtl::Network::ShapingPolicy;

int AddVswitch(HostCtl::Network::VirtualSwitchInfo& info, const std::string& name,
               int32_t numPorts) {
  try {
    const NicCapabilities capabilities = NicCapabilities::GetDefaultPolicy();
    const ShapingPolicy shaping = ShapingPolicy::GetDefaultPolicy();
    const PortSecurityPolicy security = PortSecurityPolicy::GetDefaultPolicy();
    const NicTeamingPolicy teaming = NicTeamingPolicy::GetDefaultPolicy();
    info.AddVirtualSwitch(teaming, security, shaping, capabilities, name, numPorts);
    return 0;
  } catch (const HostCtlException& e) {
    std::cerr << "Failed to add vswitch: " << name << ", Error: " << e.GetMessage() << std::endl;
    return 1;
  }
}

void CheckDeleteAdmission(HostCtl::Network::VirtualSwitchInfo& info, const std::string& name,
                          bool dvswitch) {
  if (!TarnCtl::Network::PortsetImpl::IsValidVirtualSwitch(name) ||
      (!info.SwitchExists(name) && !dvswitch)) {
    throw Failure{1, "Not a valid virtual switch or it is a DVSwitch: " + name};
  }
}

int DeleteVswitch(HostCtl::Network::VirtualSwitchInfo& info, const std::string& name) {
  try {
    info.RemoveVirtualSwitch(name);
    return 0;
  } catch (const HostCtlException& e) {
    std::cerr << "Failed to remove vswitch: " << name << ", Error: " << e.GetMessage() << std::endl;
    return 1;
  }
}

}  // namespace Commands
