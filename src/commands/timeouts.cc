// Uplink and LAG timeout commands: load the stored settings into the host,
// or print them as comma-separated lines (portset, uplink, LAG id, timeout).
#include <iostream>

#include "commands/commands.h"

namespace Commands {

void LoadUplinkTimeouts(HostCtl::Network::VirtualSwitchInfo& info,
                        const Cli::CommandOptions& options) {
  info.LoadUplinkTimeoutConfig(options.portsetName, options.lagId, options.timeoutUplinkName);
}

void PrintUplinkTimeouts(HostCtl::Network::VirtualSwitchInfo& info,
                         const Cli::CommandOptions& options) {
  for (const auto& config :
       info.GetUplinkTimeoutConfig(options.portsetName, options.lagId, options.timeoutUplinkName)) {
    // The 8-bit timeout prints as a number, not as a character.
    std::cout << config.portsetName << "," << config.uplinkName << "," << config.lagId << ","
              << static_cast<unsigned>(config.timeout) << std::endl;
  }
}

void LoadLagTimeouts(HostCtl::Network::VirtualSwitchInfo& info,
                     const Cli::CommandOptions& options) {
  info.LoadLagTimeoutConfig(options.portsetName, options.lagId);
}

void PrintLagTimeouts(HostCtl::Network::VirtualSwitchInfo& info,
                      const Cli::CommandOptions& options) {
  // Same columns as the uplink lines, with the uplink column left empty.
  for (const auto& config : info.GetLagTimeoutConfig(options.portsetName, options.lagId)) {
    std::cout << config.portsetName << ",," << config.lagId << ","
              << static_cast<unsigned>(config.timeout) << std::endl;
  }
}

}  // namespace Commands
