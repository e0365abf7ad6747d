// -c and -C: does a switch, or a port group, of this name exist?
#include <iostream>

#include "hostctl/exception.h"
#include "hostctl/network.h"
#include "hostctl/tarnctl.h"
#include "listing/listing.h"

namespace Listing {

// A distributed switch answers the lookup; a standard one only SwitchExists.
void CheckSwitch(const std::string& name) {
  TarnCtl::Network::VirtualSwitchInfoImpl info;
  bool exists = true;
  try {
    HostCtl::Network::NetworkFactory::GetDVSwitchByName(name);
  } catch (const HostCtl::Lib::HostCtlException&) {
    exists = info.SwitchExists(name);
  }
  std::cout << (exists ? "1" : "0") << std::endl;
}

void CheckPortGroup(const std::string& portGroupName) {
  TarnCtl::Network::NetworkInfoImpl network;
  const auto names = network.GetAllPortGroupNames(static_cast<HostCtl::Network::PortsetGetType>(0));
  std::cout << (names.count(portGroupName) != 0 ? "1" : "0") << std::endl;
}

}  // namespace Listing
