// Command bodies. Each takes the object it acts on and the arguments it
// needs; those that return int return the command's status (0 or 1), which
// the dispatch chain may take as the run status. Library failures that a
// body does not catch propagate as HostCtl::Lib::HostCtlException to the
// run-wide handler. No body ends the process: one that cannot go on throws
// a Failure.
#pragma once

#include <cstdint>
#include <string>

#include "cli/options.h"
#include "hostctl/exception.h"
#include "hostctl/network.h"

namespace Commands {

// Ends the run: the dispatcher writes `line` (to standard output when
// `toStandardOutput`, else to standard error) and the run ends with
// `status`. What earlier steps changed stays changed.
struct Failure {
  int status;
  std::string line;
  bool toStandardOutput = false;
};

// Returns what `read` returns; a library failure ends the run with the
// exception's message text alone.
template <typename Read>
auto OrEndWithMessage(Read read) -> decltype(read()) {
  try {
    return read();
  } catch (const HostCtl::Lib::HostCtlException& e) {
    throw Failure{1, e.GetMessage()};
  }
}

// Switch creation and removal.
int AddVswitch(HostCtl::Network::VirtualSwitchInfo& info, const std::string& name,
               int32_t numPorts);
// Admission check of -d: a Failure when `name` may not be removed (not a switch, or not a standard
// switch without --dvswitch).
void CheckDeleteAdmission(HostCtl::Network::VirtualSwitchInfo& info, const std::string& name,
                          bool dvswitch);
int DeleteVswitch(HostCtl::Network::VirtualSwitchInfo& info, const std::string& name);

// Port groups.
int AddPortgroup(HostCtl::Network::VirtualSwitch& sw, std::string portGroup);
int DeletePortgroup(HostCtl::Network::VirtualSwitch& sw, std::string portGroup);
int SetPortgroupVlan(HostCtl::Network::VirtualSwitch& sw, std::string portGroup, uint32_t vlanId);

// Uplinks and the teaming list edits they share.
bool AddUplinkToTeaming(const std::string& uplink, HostCtl::Network::NicTeamingPolicy& policy);
bool RemoveUplinkFromTeaming(const std::string& uplink, HostCtl::Network::NicTeamingPolicy& policy);
int LinkPnic(HostCtl::Network::VirtualSwitch& sw, std::string pnic);
int UnlinkPnic(HostCtl::Network::VirtualSwitch& sw, std::string pnic);
// -M and -N: CheckKnownPortGroup comes before the lookup of `sw`, named
// `switchName` on the command line, which like the reading of its uplinks
// and port groups goes through OrEndWithMessage. Both may throw a Failure.
void CheckKnownPortGroup(const std::string& portGroup);
void EditPortgroupUplinks(HostCtl::Network::VirtualSwitch& sw, const std::string& switchName,
                          const std::string& portGroup, const std::string& uplink, bool add);

// Teaming and discovery settings.
int SetMaxActive(HostCtl::Network::VirtualSwitch& sw, int32_t count);
int GetMaxActive(HostCtl::Network::VirtualSwitch& sw);
int SetOrPrintCdp(HostCtl::Network::VirtualSwitch& sw, std::string word);

// Distributed switches.
int CreateDVSwitch(HostCtl::Network::VirtualSwitchInfo& info, const Cli::CommandOptions& options);
void EditDVPortUplink(HostCtl::Network::DVSwitch& dvs, const Cli::CommandOptions& options,
                      bool add);
void TestDVPortEvent(HostCtl::Network::DVSwitch& dvs, std::string dvPortId);
void SetSwitchMTU(HostCtl::Network::VirtualSwitch& sw, uint16_t mtu);
void SetSwitchMTU(HostCtl::Network::DVSwitch& dvs, uint16_t mtu);

// ENS control. ActivateEnsNode and SignalDeviceManager throw a Failure when
// they cannot go on.
void ActivateEnsNode();
void ActivateEnsOnPortset(HostCtl::Network::Portset& portset, bool intr, bool fastSwitch);
void DeactivateEnsOnPortset(HostCtl::Network::Portset& portset);
void SignalDeviceManager();
void ReassociateEns(HostCtl::Network::Portset& portset, bool force);

// Uplink and LAG timeouts.
void LoadUplinkTimeouts(HostCtl::Network::VirtualSwitchInfo& info,
                        const Cli::CommandOptions& options);
void PrintUplinkTimeouts(HostCtl::Network::VirtualSwitchInfo& info,
                         const Cli::CommandOptions& options);
void LoadLagTimeouts(HostCtl::Network::VirtualSwitchInfo& info, const Cli::CommandOptions& options);
void PrintLagTimeouts(HostCtl::Network::VirtualSwitchInfo& info,
                      const Cli::CommandOptions& options);

// Restore.
void RestoreSwitches(HostCtl::Network::VirtualSwitchInfo& info);
void RestoreAllUplinks(HostCtl::Network::VirtualSwitchInfo& info);

}  // namespace Commands
