// The registry of the library's operations: each one's name (as the trace
// writes it and as faults name it) and what a fault's target (`--on`) may
// name for it. Every library entry point declares its operation with
// TARN_CALL (call.h), which refuses to compile when the operation is not
// registered or is not the function it is written in.
#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace TarnCtl::Instrument {

// What names the object an operation acts on.
enum TargetKind : unsigned {
  kNoTarget = 0,            // calls that carry no name
  kNameArgument = 1u << 0,  // a name the call is given (lookups, creation)
  kStandardSwitch = 1u << 1,
  kDistributedSwitch = 1u << 2,  // by switch name or portset name
  kOpaqueSwitch = 1u << 3,       // by switch name or portset name
  kPortGroup = 1u << 4,
  kDVPort = 1u << 5,  // by port id
  kRecord = 1u << 6,  // a record class, e.g. ShapingPolicy
  kAnySwitch = kStandardSwitch | kDistributedSwitch | kOpaqueSwitch,
};

// Every operation, in name order, one space between names.
inline constexpr std::string_view kOperationNames =
    "ActivateEns AddDVPortUplink AddDVSwitch AddPortGroup AddUplink AddVirtualSwitch "
    "DVPortImpl DeactivateEns GetAllPortGroupNames GetCdpStatus GetConfiguredPorts "
    "GetConnectionId GetDVPortParams GetDVPorts GetDVSwitchByName GetDVSwitchId GetDVSwitches "
    "GetDefaultPolicy GetEnsMode GetIntParamList GetLagTimeoutConfig GetMTU GetName "
    "GetNumPorts GetOpaqueSwitches GetParam GetPortGroups GetPortId GetPorts GetPortsetById "
    "GetSwitchName GetTeamingPolicy GetUplinkTimeoutConfig GetUplinks GetUsedPorts "
    "GetVirtualSwitchById GetVirtualSwitchInfo GetVirtualSwitches GetVlanId IsInUse IsValid "
    "IsValidPortGroup IsValidVirtualSwitch LoadLagTimeoutConfig LoadUplinkTimeoutConfig "
    "NODI_CheckSig NODI_ParamListDestroy NODI_Set NetworkInfoImpl ParseCdpStatus "
    "PortGroupImpl ReassociateEnsUplinks Refresh RemoveDVPortUplink RemovePortGroup "
    "RemoveUplink RemoveVirtualSwitch RestoreDVSwitches RestoreUplinks RestoreVirtualSwitches "
    "SetCdpStatus SetConnectionId SetMTU SetMaxActiveUplinks SetTeamingPolicy SetUplinkOrder "
    "SetVlanId SwitchExists TARN_ReturnStatusToString TestDVPortNota VirtualSwitchInfoImpl";

// The operations whose targets are of each kind (an operation on more than
// one kind of object is in more than one list); the others have none.
struct TargetList {
  unsigned kinds;
  std::string_view operations;
};
inline constexpr TargetList kTargetLists[] = {
    {kAnySwitch,
     "ActivateEns DeactivateEns GetConfiguredPorts GetEnsMode GetMTU GetName GetNumPorts "
     "GetUplinks GetUsedPorts ReassociateEnsUplinks SetMTU"},
    {kStandardSwitch,
     "AddPortGroup AddUplink GetCdpStatus GetPortGroups GetTeamingPolicy RemovePortGroup "
     "RemoveUplink RestoreUplinks SetCdpStatus SetTeamingPolicy"},
    {kDistributedSwitch | kOpaqueSwitch,
     "AddDVPortUplink GetDVPortParams GetDVPorts GetDVSwitchId GetSwitchName "
     "RemoveDVPortUplink"},
    {kPortGroup, "GetName GetPorts GetTeamingPolicy GetVlanId SetTeamingPolicy SetVlanId"},
    {kDVPort, "GetConnectionId GetParam GetPortId IsInUse IsValid SetConnectionId TestDVPortNota"},
    {kNameArgument,
     "AddDVSwitch AddVirtualSwitch DVPortImpl GetDVSwitchByName GetLagTimeoutConfig "
     "GetPortsetById GetUplinkTimeoutConfig GetVirtualSwitchById IsValidPortGroup "
     "IsValidVirtualSwitch LoadLagTimeoutConfig LoadUplinkTimeoutConfig ParseCdpStatus "
     "PortGroupImpl RemoveVirtualSwitch RestoreDVSwitches SwitchExists"},
    {kRecord, "GetDefaultPolicy"},
};

// Calls made without a host: they can never fail on purpose.
inline constexpr std::string_view kUnfaultable = "NODI_ParamListDestroy TARN_ReturnStatusToString";

// The position of `name` in kOperationNames, or -1.
constexpr int OperationIndex(std::string_view name) {
  int index = 0;
  for (size_t at = 0; at < kOperationNames.size(); ++index) {
    size_t end = kOperationNames.find(' ', at);
    if (end == std::string_view::npos) end = kOperationNames.size();
    if (kOperationNames.substr(at, end - at) == name) return index;
    at = end + 1;
  }
  return -1;
}

// An operation, by its position in kOperationNames.
enum class Op : int {};

struct Operation {
  Op op;
  std::string name;
  unsigned targets;  // TargetKind bits
  bool faultable;
};

const Operation& Describe(Op op);
// Every operation, in name order.
const std::vector<Operation>& Operations();
const Operation* FindOperation(std::string_view name);
// The registered name nearest to `name` (for "did you mean"), if any is
// close enough to be a likely misspelling.
std::optional<std::string> NearestOperation(std::string_view name);
// What `--on` names for an operation with these targets, in words:
// "a standard switch or a port group".
std::string TargetText(unsigned targets);

}  // namespace TarnCtl::Instrument
