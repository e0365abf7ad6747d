// -X, -x, -B and -b: the active uplink count and the discovery protocol
// status of a standard switch.
#include <iostream>

#include "commands/commands.h"
#include "hostctl/cdp_words.h"
#include "hostctl/exception.h"
#include "hostctl/tarnctl.h"

namespace Commands {

using HostCtl::Lib::HostCtlException;

int SetMaxActive(HostCtl::Network::VirtualSwitch& sw, int32_t count) {
  try {
    HostCtl::Network::NicTeamingPolicy policy = sw.GetTeamingPolicy();
    policy.SetMaxActiveUplinks(count);
    sw.SetTeamingPolicy(policy);
    return 0;
  } catch (const HostCtlException& e) {
    std::cerr << "Failed to set max active: " << sw.GetName() << ", Error: " << e.GetMessage()
              << std::endl;
    return 1;
  }
}

int GetMaxActive(HostCtl::Network::VirtualSwitch& sw) {
  try {
    const HostCtl::Network::NicTeamingPolicy policy = sw.GetTeamingPolicy();
    std::cout << policy.maxActive << std::endl;
    return 0;
  } catch (const HostCtlException& e) {
    std::cerr << "Failed to get max active: " << sw.GetName() << ", Error: " << e.GetMessage()
              << std::endl;
    return 1;
  }
}

// The word "print" reads the status instead of setting it.
int SetOrPrintCdp(HostCtl::Network::VirtualSwitch& sw, std::string word) {
  try {
    if (word == "print") {
      std::cout << HostCtl::Text::CdpWord(sw.GetCdpStatus()) << std::endl;
    } else {
      sw.SetCdpStatus(TarnCtl::Network::VirtualSwitchImpl::ParseCdpStatus(word));
    }
    return 0;
  } catch (const HostCtlException& e) {
    std::cerr << "Failed to set CDP status on: " << sw.GetName() << ", Error: " << e.GetMessage()
              << std::endl;
    return 1;
  }
}

}  // namespace Commands
