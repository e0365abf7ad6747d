// Restore commands: switches from the stored configuration and the distributed
// switch cache, and the uplinks of every standard switch.
#include <iostream>

#include "commands/commands.h"
#include "hostctl/tarnctl.h"

namespace Commands {

void RestoreSwitches(HostCtl::Network::VirtualSwitchInfo& info) {
  // The standard switches are restored even when the distributed ones fail.
  try {
    info.RestoreDVSwitches(TarnCtl::Network::NetworkInfoImpl::DefaultDVSCacheFile);
  } catch (const HostCtl::Lib::HostCtlException& e) {
    std::cerr << e.GetMessage() << std::endl;
  }
  info.Refresh();
  info.RestoreVirtualSwitches();
}

void RestoreAllUplinks(HostCtl::Network::VirtualSwitchInfo& info) {
  // A failure stops here; switches restored before it stay restored.
  for (const auto& sw : info.GetVirtualSwitches(false)) sw->RestoreUplinks();
}

}  // namespace Commands
