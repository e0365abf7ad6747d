// The registry of the library's operations: each one's name (as the trace
// writes it and as faults name it) and what a fault's target (`--on`) may
// name for it. Every library entry point declares its operation with
// TARN_CALL (call.h), which refuses to compile when the operation is not
// the function it stands in.
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

// X(name, targets, faultable): every operation, in name order.
#define TARN_OPERATIONS(X)                                        \
  X(ActivateEns, kAnySwitch, true)                                \
  X(AddDVPortUplink, kDistributedSwitch | kOpaqueSwitch, true)    \
  X(AddDVSwitch, kNameArgument, true)                             \
  X(AddPortGroup, kStandardSwitch, true)                          \
  X(AddUplink, kStandardSwitch, true)                             \
  X(AddVirtualSwitch, kNameArgument, true)                        \
  X(DVPortImpl, kNameArgument, true)                              \
  X(DeactivateEns, kAnySwitch, true)                              \
  X(GetAllPortGroupNames, kNoTarget, true)                        \
  X(GetCdpStatus, kStandardSwitch, true)                          \
  X(GetConfiguredPorts, kAnySwitch, true)                         \
  X(GetConnectionId, kDVPort, true)                               \
  X(GetDVPortParams, kDistributedSwitch | kOpaqueSwitch, true)    \
  X(GetDVPorts, kDistributedSwitch | kOpaqueSwitch, true)         \
  X(GetDVSwitchByName, kNameArgument, true)                       \
  X(GetDVSwitchId, kDistributedSwitch | kOpaqueSwitch, true)      \
  X(GetDVSwitches, kNoTarget, true)                               \
  X(GetDefaultPolicy, kRecord, true)                              \
  X(GetEnsMode, kAnySwitch, true)                                 \
  X(GetIntParamList, kNoTarget, true)                             \
  X(GetLagTimeoutConfig, kNameArgument, true)                     \
  X(GetMTU, kAnySwitch, true)                                     \
  X(GetName, kAnySwitch | kPortGroup, true)                       \
  X(GetNumPorts, kAnySwitch, true)                                \
  X(GetOpaqueSwitches, kNoTarget, true)                           \
  X(GetParam, kDVPort, true)                                      \
  X(GetPortGroups, kStandardSwitch, true)                         \
  X(GetPortId, kDVPort, true)                                     \
  X(GetPorts, kPortGroup, true)                                   \
  X(GetPortsetById, kNameArgument, true)                          \
  X(GetSwitchName, kDistributedSwitch | kOpaqueSwitch, true)      \
  X(GetTeamingPolicy, kStandardSwitch | kPortGroup, true)         \
  X(GetUplinkTimeoutConfig, kNameArgument, true)                  \
  X(GetUplinks, kAnySwitch, true)                                 \
  X(GetUsedPorts, kAnySwitch, true)                               \
  X(GetVirtualSwitchById, kNameArgument, true)                    \
  X(GetVirtualSwitchInfo, kNoTarget, true)                        \
  X(GetVirtualSwitches, kNoTarget, true)                          \
  X(GetVlanId, kPortGroup, true)                                  \
  X(IsInUse, kDVPort, true)                                       \
  X(IsValid, kDVPort, true)                                       \
  X(IsValidPortGroup, kNameArgument, true)                        \
  X(IsValidVirtualSwitch, kNameArgument, true)                    \
  X(LoadLagTimeoutConfig, kNameArgument, true)                    \
  X(LoadUplinkTimeoutConfig, kNameArgument, true)                 \
  X(NODI_CheckSig, kNoTarget, true)                               \
  X(NODI_ParamListDestroy, kNoTarget, false)                      \
  X(NODI_Set, kNoTarget, true)                                    \
  X(NetworkInfoImpl, kNoTarget, true)                             \
  X(ParseCdpStatus, kNameArgument, true)                          \
  X(PortGroupImpl, kNameArgument, true)                           \
  X(ReassociateEnsUplinks, kAnySwitch, true)                      \
  X(Refresh, kNoTarget, true)                                     \
  X(RemoveDVPortUplink, kDistributedSwitch | kOpaqueSwitch, true) \
  X(RemovePortGroup, kStandardSwitch, true)                       \
  X(RemoveUplink, kStandardSwitch, true)                          \
  X(RemoveVirtualSwitch, kNameArgument, true)                     \
  X(RestoreDVSwitches, kNameArgument, true)                       \
  X(RestoreUplinks, kStandardSwitch, true)                        \
  X(RestoreVirtualSwitches, kNoTarget, true)                      \
  X(SetCdpStatus, kStandardSwitch, true)                          \
  X(SetConnectionId, kDVPort, true)                               \
  X(SetMTU, kAnySwitch, true)                                     \
  X(SetMaxActiveUplinks, kNoTarget, true)                         \
  X(SetTeamingPolicy, kStandardSwitch | kPortGroup, true)         \
  X(SetUplinkOrder, kNoTarget, true)                              \
  X(SetVlanId, kPortGroup, true)                                  \
  X(SwitchExists, kNameArgument, true)                            \
  X(TARN_ReturnStatusToString, kNoTarget, false)                  \
  X(TestDVPortNota, kDVPort, true)                                \
  X(VirtualSwitchInfoImpl, kNoTarget, true)

enum class Op {
#define TARN_OPERATION_ENUM(name, targets, faultable) k##name,
  TARN_OPERATIONS(TARN_OPERATION_ENUM)
#undef TARN_OPERATION_ENUM
};

struct Operation {
  Op op;
  const char* name;
  unsigned targets;  // TargetKind bits
  // False for calls made without a host (they can never fail on purpose).
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
