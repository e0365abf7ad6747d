// The -l tables and the -c / -C existence checks.
#pragma once

#include <string>

#include "hostctl/network.h"

namespace Listing {

// Lists every standard switch (only the system ones with `system`), then,
// without `system`, every distributed and opaque switch. Returns 1 when no
// switch was listed, else 0.
int ListAllSwitches(HostCtl::Network::VirtualSwitchInfo& info, bool system);
void ListVirtualSwitch(HostCtl::Network::VirtualSwitch& sw);
void ListDVSwitch(HostCtl::Network::DVSwitch& dvs);
void ListOpaqueSwitch(HostCtl::Network::DVSwitch& sw);

// Print "1" or "0" on a line of its own.
void CheckSwitch(const std::string& name);
void CheckPortGroup(const std::string& portGroupName);

}  // namespace Listing
