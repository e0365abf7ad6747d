// The walk of the dispatch chain, its lookups and the run-wide handler.
#include "cli/dispatch.h"

#include <iostream>
#include <memory>

#include "cli/chain.h"
#include "cli/checks.h"
#include "commands/commands.h"
#include "hostctl/exception.h"
#include "hostctl/tarnctl.h"

namespace Cli {
namespace {

using HostCtl::Network::NetworkFactory;
using HostCtl::Network::PortsetGetType;
using HostCtl::Network::VirtualSwitchInfo;

constexpr PortsetGetType kDefaultGet = static_cast<PortsetGetType>(0);

Target LookUp(Lookup lookup, const CommandOptions& options) {
  Target target;
  const std::string& name = options.switchName;
  switch (lookup) {
    case Lookup::kNone:
      break;
    case Lookup::kVirtualSwitch:
      target.sw = NetworkFactory::GetVirtualSwitchById(name, kDefaultGet);
      break;
    case Lookup::kDVSwitch:
      target.dvs = NetworkFactory::GetDVSwitchByName(name);
      break;
    case Lookup::kVirtualSwitchOrDVS:
      try {
        target.sw = NetworkFactory::GetVirtualSwitchById(name, kDefaultGet);
      } catch (const HostCtl::Lib::HostCtlException&) {
        target.dvs = NetworkFactory::GetDVSwitchByName(name);
      }
      break;
    case Lookup::kPortsetAfterSignal:
      if ((options.mask & Bit::kForceReassociateEns) != 0) Commands::SignalDeviceManager();
      target.portset = NetworkFactory::GetPortsetById(name);
      break;
    case Lookup::kPortset:
      target.portset = NetworkFactory::GetPortsetById(name);
      break;
    case Lookup::kPortGroupSwitch:
      Commands::CheckKnownPortGroup(options.portGroupName);
      target.sw = Commands::OrEndWithMessage(
          [&] { return NetworkFactory::GetVirtualSwitchById(name, kDefaultGet); });
      break;
  }
  return target;
}

int RunChain(const CommandOptions& options, VirtualSwitchInfo& info) {
  int status = 0;
  for (const Step& step : kChain) {
    if ((options.mask & step.bits) == 0) continue;
    Target target = LookUp(step.lookup, options);
    StepContext context{options, info, target};
    const int result = step.body(context);
    if (step.status == Status::kSet) status = result;
  }
  return status;
}

// Writes the line of a failure that ends the run; its status.
int Report(const Commands::Failure& failure) {
  (failure.toStandardOutput ? std::cout : std::cerr) << failure.line << std::endl;
  return failure.status;
}

}  // namespace

int RunCommands(CommandOptions& options, int argc, char** argv, int firstOperand) {
  CheckArguments(options, argc, argv, firstOperand);
  if ((options.mask & Bit::kEnsReady) != 0) {
    try {
      Commands::ActivateEnsNode();
      return 0;
    } catch (const Commands::Failure& failure) {
      return Report(failure);
    }
  }
  try {
    // Declared in this order so that the switch information object is
    // released before the network information object, on every path.
    TarnCtl::Network::NetworkInfoImpl network;
    std::unique_ptr<VirtualSwitchInfo> info = network.GetVirtualSwitchInfo();
    try {
      return RunChain(options, *info);
    } catch (const Commands::Failure& failure) {
      // Written while the host is open: its changes are kept after the line.
      return Report(failure);
    }
  } catch (const HostCtl::Lib::HostCtlException& e) {
    std::cerr << e.GetDetailedMessage() << std::endl;
    return 1;
  }
}

}  // namespace Cli
