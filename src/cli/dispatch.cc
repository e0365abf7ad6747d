// The dispatch chain: one table of steps walked in order. A step is taken
// when any of its bits is set; it looks up the object its body acts on,
// calls the body, releases the object, and may take the body's result as
// the run status.
#include "cli/dispatch.h"

#include <array>
#include <iostream>
#include <memory>

#include "cli/checks.h"
#include "commands/commands.h"
#include "hostctl/exception.h"
#include "hostctl/network.h"
#include "hostctl/tarnctl.h"
#include "listing/listing.h"

namespace Cli {
namespace {

using HostCtl::Network::DVSwitch;
using HostCtl::Network::NetworkFactory;
using HostCtl::Network::Portset;
using HostCtl::Network::PortsetGetType;
using HostCtl::Network::VirtualSwitch;
using HostCtl::Network::VirtualSwitchInfo;

constexpr PortsetGetType kDefaultGet = static_cast<PortsetGetType>(0);

// What a step looks up before its body runs.
enum class Lookup {
  kNone,
  kVirtualSwitch,       // GetVirtualSwitchById(switchName, 0)
  kDVSwitch,            // GetDVSwitchByName(switchName)
  kVirtualSwitchOrDVS,  // the standard switch, else the distributed one
  kPortset,             // GetPortsetById(switchName)
  kPortsetAfterSignal,  // the same, after signalling the device manager for -f
  kPortGroupSwitch,     // GetVirtualSwitchById, once -p names a known port group;
                        // a failure ends the run with its short message
};

// The objects a step owns while its body runs; released when the step ends.
struct Target {
  std::unique_ptr<VirtualSwitch> sw;
  std::unique_ptr<DVSwitch> dvs;
  std::unique_ptr<Portset> portset;
};

struct StepContext {
  const CommandOptions& options;
  VirtualSwitchInfo& info;
  Target& target;

  bool Has(CommandMask bits) const { return (options.mask & bits) != 0; }
};

enum class Status { kSet, kKeep };

struct Step {
  CommandMask bits;
  Lookup lookup;
  int (*body)(StepContext&);
  Status status;
};

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
      try {
        target.sw = NetworkFactory::GetVirtualSwitchById(name, kDefaultGet);
      } catch (const HostCtl::Lib::HostCtlException& e) {
        throw Commands::Failure{1, e.GetMessage()};
      }
      break;
  }
  return target;
}

// Bodies whose Status is kKeep return 0; the walk ignores it.
const std::array<Step, 26> kChain = {{
    {Bit::kAdd, Lookup::kNone,
     [](StepContext& c) {
       if (c.Has(Bit::kDvswitch)) return Commands::CreateDVSwitch(c.info, c.options);
       return Commands::AddVswitch(c.info, c.options.switchName, c.options.numPorts);
     },
     Status::kSet},
    {Bit::kDelete, Lookup::kNone,
     [](StepContext& c) {
       Commands::CheckDeleteAdmission(c.info, c.options.switchName, c.Has(Bit::kDvswitch));
       return Commands::DeleteVswitch(c.info, c.options.switchName);
     },
     Status::kSet},
    {Bit::kLink, Lookup::kVirtualSwitch,
     [](StepContext& c) { return Commands::LinkPnic(*c.target.sw, c.options.uplinkName); },
     Status::kSet},
    {Bit::kUnlink, Lookup::kVirtualSwitch,
     [](StepContext& c) { return Commands::UnlinkPnic(*c.target.sw, c.options.uplinkName); },
     Status::kSet},
    {Bit::kRestore, Lookup::kNone,
     [](StepContext& c) {
       Commands::RestoreSwitches(c.info);
       return 0;
     },
     Status::kKeep},
    {Bit::kAddPg, Lookup::kVirtualSwitch,
     [](StepContext& c) { return Commands::AddPortgroup(*c.target.sw, c.options.portGroupName); },
     Status::kSet},
    {Bit::kDelPg, Lookup::kVirtualSwitch,
     [](StepContext& c) {
       return Commands::DeletePortgroup(*c.target.sw, c.options.portGroupName);
     },
     Status::kSet},
    {Bit::kList, Lookup::kNone,
     [](StepContext& c) { return Listing::ListAllSwitches(c.info, c.Has(Bit::kSystem)); },
     Status::kSet},
    {Bit::kCheckPg, Lookup::kNone,
     [](StepContext& c) {
       Listing::CheckPortGroup(c.options.portGroupName);
       return 0;
     },
     Status::kKeep},
    {Bit::kCheck, Lookup::kNone,
     [](StepContext& c) {
       Listing::CheckSwitch(c.options.switchName);
       return 0;
     },
     Status::kKeep},
    {Bit::kVlan, Lookup::kVirtualSwitch,
     [](StepContext& c) {
       return Commands::SetPortgroupVlan(*c.target.sw, c.options.portGroupName, c.options.vlanId);
     },
     Status::kSet},
    {Bit::kCdp, Lookup::kVirtualSwitch,
     [](StepContext& c) { return Commands::SetOrPrintCdp(*c.target.sw, c.options.cdpStatus); },
     Status::kSet},
    {Bit::kSetMaxActive, Lookup::kVirtualSwitch,
     [](StepContext& c) { return Commands::SetMaxActive(*c.target.sw, c.options.maxActive); },
     Status::kSet},
    {Bit::kGetMaxActive, Lookup::kVirtualSwitch,
     [](StepContext& c) { return Commands::GetMaxActive(*c.target.sw); }, Status::kSet},
    {Bit::kAddPgUplink | Bit::kDelPgUplink, Lookup::kPortGroupSwitch,
     [](StepContext& c) {
       Commands::EditPortgroupUplinks(*c.target.sw, c.options.switchName, c.options.portGroupName,
                                      c.options.uplinkName, c.Has(Bit::kAddPgUplink));
       return 0;
     },
     Status::kKeep},
    {Bit::kAddDvpUplink | Bit::kDelDvpUplink, Lookup::kDVSwitch,
     [](StepContext& c) {
       Commands::EditDVPortUplink(*c.target.dvs, c.options, c.Has(Bit::kAddDvpUplink));
       return 0;
     },
     Status::kKeep},
    {Bit::kTestSyncNota, Lookup::kDVSwitch,
     [](StepContext& c) {
       Commands::TestDVPortEvent(*c.target.dvs, c.options.dvPortId);
       return 0;
     },
     Status::kKeep},
    {Bit::kMtu, Lookup::kVirtualSwitchOrDVS,
     [](StepContext& c) {
       if (c.target.sw) {
         Commands::SetSwitchMTU(*c.target.sw, c.options.mtu);
       } else {
         Commands::SetSwitchMTU(*c.target.dvs, c.options.mtu);
       }
       return 0;
     },
     Status::kKeep},
    {Bit::kRestoreUplinks, Lookup::kNone,
     [](StepContext& c) {
       Commands::RestoreAllUplinks(c.info);
       return 0;
     },
     Status::kKeep},
    {Bit::kActivateEns, Lookup::kPortset,
     [](StepContext& c) {
       Commands::ActivateEnsOnPortset(*c.target.portset, c.Has(Bit::kIntr),
                                      c.Has(Bit::kFastSwitch));
       return 0;
     },
     Status::kKeep},
    {Bit::kDeactivateEns, Lookup::kPortset,
     [](StepContext& c) {
       Commands::DeactivateEnsOnPortset(*c.target.portset);
       return 0;
     },
     Status::kKeep},
    {Bit::kReassociateEns | Bit::kForceReassociateEns, Lookup::kPortsetAfterSignal,
     [](StepContext& c) {
       Commands::ReassociateEns(*c.target.portset, c.Has(Bit::kForceReassociateEns));
       return 0;
     },
     Status::kKeep},
    {Bit::kLoadLacpTimeout, Lookup::kNone,
     [](StepContext& c) {
       Commands::LoadUplinkTimeouts(c.info, c.options);
       return 0;
     },
     Status::kKeep},
    {Bit::kGetLacpTimeout, Lookup::kNone,
     [](StepContext& c) {
       Commands::PrintUplinkTimeouts(c.info, c.options);
       return 0;
     },
     Status::kKeep},
    {Bit::kLoadLagTimeout, Lookup::kNone,
     [](StepContext& c) {
       Commands::LoadLagTimeouts(c.info, c.options);
       return 0;
     },
     Status::kKeep},
    {Bit::kGetLagTimeout, Lookup::kNone,
     [](StepContext& c) {
       Commands::PrintLagTimeouts(c.info, c.options);
       return 0;
     },
     Status::kKeep},
}};

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
