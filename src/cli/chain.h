// The dispatch chain's table: one step per command, walked in order. A step
// is taken when any of its bits is set; it looks up the object its body
// acts on, calls the body, releases the object, and may take the body's
// result as the run status. The argument checks read what each step needs
// from the same table.
#pragma once

#include <array>
#include <memory>

#include "cli/options.h"
#include "commands/commands.h"
#include "hostctl/network.h"
#include "listing/listing.h"

namespace Cli {

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
  std::unique_ptr<HostCtl::Network::VirtualSwitch> sw;
  std::unique_ptr<HostCtl::Network::DVSwitch> dvs;
  std::unique_ptr<HostCtl::Network::Portset> portset;
};

struct StepContext {
  const CommandOptions& options;
  HostCtl::Network::VirtualSwitchInfo& info;
  Target& target;

  bool Has(CommandMask bits) const { return (options.mask & bits) != 0; }
};

enum class Status { kSet, kKeep };

// What a step's command cannot do without; checked before the chain runs.
namespace Need {
constexpr unsigned kNothing = 0;
constexpr unsigned kSwitchName = 1;     // the positional argument, shorter than the limit
constexpr unsigned kAnySwitchName = 2;  // the positional argument, of any length
constexpr unsigned kPortGroup = 4;      // -p
constexpr unsigned kDVPort = 8;         // -V
}  // namespace Need

struct Step {
  CommandMask bits;
  Lookup lookup;
  unsigned needs;  // Need bits
  int (*body)(StepContext&);
  Status status;
};

// In the order the steps are taken. Bodies whose Status is kKeep return 0;
// the walk ignores it.
inline constexpr std::array<Step, 26> kChain = {{
    {Bit::kAdd, Lookup::kNone, Need::kSwitchName,
     [](StepContext& c) {
       if (c.Has(Bit::kDvswitch)) return Commands::CreateDVSwitch(c.info, c.options);
       return Commands::AddVswitch(c.info, c.options.switchName, c.options.numPorts);
     },
     Status::kSet},
    {Bit::kDelete, Lookup::kNone, Need::kSwitchName,
     [](StepContext& c) {
       Commands::CheckDeleteAdmission(c.info, c.options.switchName, c.Has(Bit::kDvswitch));
       return Commands::DeleteVswitch(c.info, c.options.switchName);
     },
     Status::kSet},
    {Bit::kLink, Lookup::kVirtualSwitch, Need::kSwitchName,
     [](StepContext& c) { return Commands::LinkPnic(*c.target.sw, c.options.uplinkName); },
     Status::kSet},
    {Bit::kUnlink, Lookup::kVirtualSwitch, Need::kSwitchName,
     [](StepContext& c) { return Commands::UnlinkPnic(*c.target.sw, c.options.uplinkName); },
     Status::kSet},
    {Bit::kRestore, Lookup::kNone, Need::kNothing,
     [](StepContext& c) {
       Commands::RestoreSwitches(c.info);
       return 0;
     },
     Status::kKeep},
    {Bit::kAddPg, Lookup::kVirtualSwitch, Need::kSwitchName,
     [](StepContext& c) { return Commands::AddPortgroup(*c.target.sw, c.options.portGroupName); },
     Status::kSet},
    {Bit::kDelPg, Lookup::kVirtualSwitch, Need::kSwitchName,
     [](StepContext& c) {
       return Commands::DeletePortgroup(*c.target.sw, c.options.portGroupName);
     },
     Status::kSet},
    {Bit::kList, Lookup::kNone, Need::kNothing,
     [](StepContext& c) { return Listing::ListAllSwitches(c.info, c.Has(Bit::kSystem)); },
     Status::kSet},
    {Bit::kCheckPg, Lookup::kNone, Need::kNothing,
     [](StepContext& c) {
       Listing::CheckPortGroup(c.options.portGroupName);
       return 0;
     },
     Status::kKeep},
    {Bit::kCheck, Lookup::kNone, Need::kSwitchName,
     [](StepContext& c) {
       Listing::CheckSwitch(c.options.switchName);
       return 0;
     },
     Status::kKeep},
    {Bit::kVlan, Lookup::kVirtualSwitch, Need::kSwitchName | Need::kPortGroup,
     [](StepContext& c) {
       return Commands::SetPortgroupVlan(*c.target.sw, c.options.portGroupName, c.options.vlanId);
     },
     Status::kSet},
    {Bit::kCdp, Lookup::kVirtualSwitch, Need::kSwitchName,
     [](StepContext& c) { return Commands::SetOrPrintCdp(*c.target.sw, c.options.cdpStatus); },
     Status::kSet},
    {Bit::kSetMaxActive, Lookup::kVirtualSwitch, Need::kSwitchName,
     [](StepContext& c) { return Commands::SetMaxActive(*c.target.sw, c.options.maxActive); },
     Status::kSet},
    {Bit::kGetMaxActive, Lookup::kVirtualSwitch, Need::kSwitchName,
     [](StepContext& c) { return Commands::GetMaxActive(*c.target.sw); }, Status::kSet},
    {Bit::kAddPgUplink | Bit::kDelPgUplink, Lookup::kPortGroupSwitch,
     Need::kSwitchName | Need::kPortGroup,
     [](StepContext& c) {
       Commands::EditPortgroupUplinks(*c.target.sw, c.options.switchName, c.options.portGroupName,
                                      c.options.uplinkName, c.Has(Bit::kAddPgUplink));
       return 0;
     },
     Status::kKeep},
    {Bit::kAddDvpUplink | Bit::kDelDvpUplink, Lookup::kDVSwitch,
     Need::kAnySwitchName | Need::kDVPort,
     [](StepContext& c) {
       Commands::EditDVPortUplink(*c.target.dvs, c.options, c.Has(Bit::kAddDvpUplink));
       return 0;
     },
     Status::kKeep},
    {Bit::kTestSyncNota, Lookup::kDVSwitch, Need::kSwitchName | Need::kDVPort,
     [](StepContext& c) {
       Commands::TestDVPortEvent(*c.target.dvs, c.options.dvPortId);
       return 0;
     },
     Status::kKeep},
    {Bit::kMtu, Lookup::kVirtualSwitchOrDVS, Need::kSwitchName,
     [](StepContext& c) {
       if (c.target.sw) {
         Commands::SetSwitchMTU(*c.target.sw, c.options.mtu);
       } else {
         Commands::SetSwitchMTU(*c.target.dvs, c.options.mtu);
       }
       return 0;
     },
     Status::kKeep},
    {Bit::kRestoreUplinks, Lookup::kNone, Need::kNothing,
     [](StepContext& c) {
       Commands::RestoreAllUplinks(c.info);
       return 0;
     },
     Status::kKeep},
    {Bit::kActivateEns, Lookup::kPortset, Need::kSwitchName,
     [](StepContext& c) {
       Commands::ActivateEnsOnPortset(*c.target.portset, c.Has(Bit::kIntr),
                                      c.Has(Bit::kFastSwitch));
       return 0;
     },
     Status::kKeep},
    {Bit::kDeactivateEns, Lookup::kPortset, Need::kSwitchName,
     [](StepContext& c) {
       Commands::DeactivateEnsOnPortset(*c.target.portset);
       return 0;
     },
     Status::kKeep},
    {Bit::kReassociateEns | Bit::kForceReassociateEns, Lookup::kPortsetAfterSignal,
     Need::kSwitchName,
     [](StepContext& c) {
       Commands::ReassociateEns(*c.target.portset, c.Has(Bit::kForceReassociateEns));
       return 0;
     },
     Status::kKeep},
    {Bit::kLoadLacpTimeout, Lookup::kNone, Need::kNothing,
     [](StepContext& c) {
       Commands::LoadUplinkTimeouts(c.info, c.options);
       return 0;
     },
     Status::kKeep},
    {Bit::kGetLacpTimeout, Lookup::kNone, Need::kNothing,
     [](StepContext& c) {
       Commands::PrintUplinkTimeouts(c.info, c.options);
       return 0;
     },
     Status::kKeep},
    {Bit::kLoadLagTimeout, Lookup::kNone, Need::kNothing,
     [](StepContext& c) {
       Commands::LoadLagTimeouts(c.info, c.options);
       return 0;
     },
     Status::kKeep},
    {Bit::kGetLagTimeout, Lookup::kNone, Need::kNothing,
     [](StepContext& c) {
       Commands::PrintLagTimeouts(c.info, c.options);
       return 0;
     },
     Status::kKeep},
}};

// The bits of every step that needs any of `needs`.
constexpr CommandMask CommandsNeeding(unsigned needs) {
  CommandMask mask = 0;
  for (const Step& step : kChain)
    if ((step.needs & needs) != 0) mask |= step.bits;
  return mask;
}

}  // namespace Cli
