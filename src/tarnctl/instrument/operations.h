// The registry of the library's operations, one table: each one's name (as
// the trace writes it and as faults name it), what a fault's target (`--on`)
// may name for it, and whether it reads or changes the host or runs without
// it. Every library entry point declares its operation with TARN_CALL
// (call.h), which refuses to compile when the operation is not registered or
// is not the function it is written in.
#pragma once

#include <iterator>
#include <optional>
#include <span>
#include <string>
#include <string_view>

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

// How an operation uses the host.
enum class Access : unsigned char {
  kNone,     // runs without a host (no fault can hit it)
  kReads,    // reads the host, or leaves it alone
  kChanges,  // may change the host: runs in a savepoint of its own (call.h)
};
using enum Access;

struct Operation {
  constexpr Operation(const char* name, unsigned targets, Access access = kReads)
      : name(name), targets(targets), access(access), faultable(access != Access::kNone) {}

  const char* name;  // as the trace writes it and faults name it
  unsigned targets;  // TargetKind bits: what a fault's `--on` may name
  Access access;
  bool faultable;
};

// Every operation, in name order.
inline constexpr Operation kOperations[] = {
    {"ActivateEns", kAnySwitch, kChanges},
    {"AddDVPortUplink", kDistributedSwitch | kOpaqueSwitch, kChanges},
    {"AddDVSwitch", kNameArgument, kChanges},
    {"AddPortGroup", kStandardSwitch, kChanges},
    {"AddUplink", kStandardSwitch, kChanges},
    {"AddVirtualSwitch", kNameArgument, kChanges},
    {"DVPortImpl", kNameArgument},
    {"DeactivateEns", kAnySwitch, kChanges},
    {"GetAllPortGroupNames", kNoTarget},
    {"GetCdpStatus", kStandardSwitch},
    {"GetConfiguredPorts", kAnySwitch},
    {"GetConnectionId", kDVPort},
    {"GetDVPortParams", kDistributedSwitch | kOpaqueSwitch},
    {"GetDVPorts", kDistributedSwitch | kOpaqueSwitch},
    {"GetDVSwitchByName", kNameArgument},
    {"GetDVSwitchId", kDistributedSwitch | kOpaqueSwitch},
    {"GetDVSwitches", kNoTarget},
    {"GetDefaultPolicy", kRecord},
    {"GetEnsMode", kAnySwitch},
    {"GetIntParamList", kNoTarget},
    {"GetLagTimeoutConfig", kNameArgument},
    {"GetMTU", kAnySwitch},
    {"GetName", kAnySwitch | kPortGroup},
    {"GetNumPorts", kAnySwitch},
    {"GetOpaqueSwitches", kNoTarget},
    {"GetParam", kDVPort},
    {"GetPortGroups", kStandardSwitch},
    {"GetPortId", kDVPort},
    {"GetPorts", kPortGroup},
    {"GetPortsetById", kNameArgument},
    {"GetSwitchName", kDistributedSwitch | kOpaqueSwitch},
    {"GetTeamingPolicy", kStandardSwitch | kPortGroup},
    {"GetUplinkTimeoutConfig", kNameArgument},
    {"GetUplinks", kAnySwitch},
    {"GetUsedPorts", kAnySwitch},
    {"GetVirtualSwitchById", kNameArgument},
    {"GetVirtualSwitchInfo", kNoTarget},
    {"GetVirtualSwitches", kNoTarget},
    {"GetVlanId", kPortGroup},
    {"IsInUse", kDVPort},
    {"IsValid", kDVPort},
    {"IsValidPortGroup", kNameArgument},
    {"IsValidVirtualSwitch", kNameArgument},
    {"LoadLagTimeoutConfig", kNameArgument, kChanges},
    {"LoadUplinkTimeoutConfig", kNameArgument, kChanges},
    {"NODI_CheckSig", kNoTarget},
    {"NODI_ParamListDestroy", kNoTarget, kNone},
    {"NODI_Set", kNoTarget, kChanges},
    {"NetworkInfoImpl", kNoTarget},
    {"ParseCdpStatus", kNameArgument},
    {"PortGroupImpl", kNameArgument},
    {"ReassociateEnsUplinks", kAnySwitch, kChanges},
    {"Refresh", kNoTarget},
    {"RemoveDVPortUplink", kDistributedSwitch | kOpaqueSwitch, kChanges},
    {"RemovePortGroup", kStandardSwitch, kChanges},
    {"RemoveUplink", kStandardSwitch, kChanges},
    {"RemoveVirtualSwitch", kNameArgument, kChanges},
    {"RestoreDVSwitches", kNameArgument, kChanges},
    {"RestoreUplinks", kStandardSwitch, kChanges},
    {"RestoreVirtualSwitches", kNoTarget, kChanges},
    {"SetCdpStatus", kStandardSwitch, kChanges},
    {"SetConnectionId", kDVPort, kChanges},
    {"SetMTU", kAnySwitch, kChanges},
    {"SetMaxActiveUplinks", kNoTarget},
    {"SetTeamingPolicy", kStandardSwitch | kPortGroup, kChanges},
    {"SetUplinkOrder", kNoTarget},
    {"SetVlanId", kPortGroup, kChanges},
    {"SwitchExists", kNameArgument},
    {"TARN_ReturnStatusToString", kNoTarget, kNone},
    {"TestDVPortNota", kDVPort, kChanges},
    {"VirtualSwitchInfoImpl", kNoTarget},
};

// The position of `name` in kOperations, or -1.
constexpr int OperationIndex(std::string_view name) {
  for (size_t i = 0; i < std::size(kOperations); ++i) {
    if (kOperations[i].name == name) return static_cast<int>(i);
  }
  return -1;
}

// The table is searched by halving (FindOperation), and an operation's
// position is its Op: the names are sorted and unique, each a C++ name.
constexpr bool WellFormed(const Operation& operation) {
  const std::string_view name = operation.name;
  if (name.empty() || (name[0] >= '0' && name[0] <= '9')) return false;
  for (const char c : name) {
    const bool word =
        (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || (c >= '0' && c <= '9') || c == '_';
    if (!word) return false;
  }
  // A call without a host has nothing to be matched on.
  return operation.access != kNone || operation.targets == kNoTarget;
}
static_assert(
    [] {
      for (size_t i = 0; i < std::size(kOperations); ++i) {
        if (!WellFormed(kOperations[i])) return false;
        if (i > 0 && std::string_view(kOperations[i - 1].name) >= kOperations[i].name) return false;
      }
      return true;
    }(),
    "kOperations must list well-formed operations in strict name order");

// An operation, by its position in kOperations.
enum class Op : int {};

const Operation& Describe(Op op);
// Every operation, in name order.
constexpr std::span<const Operation> Operations() {
  return kOperations;
}
const Operation* FindOperation(std::string_view name);
// The registered name nearest to `name` (for "did you mean"), if any is
// close enough to be a likely misspelling.
std::optional<std::string> NearestOperation(std::string_view name);
// What `--on` names for an operation with these targets, in words:
// "a standard switch or a port group".
std::string TargetText(unsigned targets);

}  // namespace TarnCtl::Instrument
