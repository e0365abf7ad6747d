// The command line as the tool reads it: the command mask and the option
// arguments, converted and checked.
#pragma once

#include <cstdint>
#include <string>

namespace Cli {

// One bit per command or modifier option.
using CommandMask = uint64_t;

namespace Bit {
constexpr CommandMask kAdd = 0x1;
constexpr CommandMask kDelete = 0x2;
constexpr CommandMask kList = 0x4;
constexpr CommandMask kLink = 0x8;
constexpr CommandMask kUnlink = 0x10;
constexpr CommandMask kRestore = 0x20;
constexpr CommandMask kAddPg = 0x40;
constexpr CommandMask kDelPg = 0x80;
constexpr CommandMask kCheck = 0x100;
constexpr CommandMask kCheckPg = 0x200;
constexpr CommandMask kVlan = 0x400;
constexpr CommandMask kCdp = 0x800;  // set-cdp and get-cdp share it
constexpr CommandMask kMtu = 0x1000;
constexpr CommandMask kTestSyncNota = 0x2000;
constexpr CommandMask kAddPgUplink = 0x4000;
constexpr CommandMask kDelPgUplink = 0x8000;
constexpr CommandMask kAddDvpUplink = 0x10000;
constexpr CommandMask kDelDvpUplink = 0x20000;
constexpr CommandMask kGetMaxActive = 0x40000;
constexpr CommandMask kSetMaxActive = 0x80000;
constexpr CommandMask kRestoreUplinks = 0x100000;
constexpr CommandMask kDvswitch = 0x200000;
constexpr CommandMask kUuid = 0x400000;
constexpr CommandMask kImplClass = 0x800000;
constexpr CommandMask kVersion = 0x1000000;
constexpr CommandMask kActivateEns = 0x2000000;
constexpr CommandMask kDeactivateEns = 0x4000000;
constexpr CommandMask kReassociateEns = 0x8000000;
constexpr CommandMask kEnsReady = 0x10000000;
constexpr CommandMask kForceReassociateEns = 0x20000000;
constexpr CommandMask kIntr = 0x40000000;
constexpr CommandMask kFastSwitch = 0x80000000;
constexpr CommandMask kGetLacpTimeout = 0x100000000;
constexpr CommandMask kLoadLacpTimeout = 0x200000000;
constexpr CommandMask kPortset = 0x400000000;
constexpr CommandMask kLagId = 0x800000000;
constexpr CommandMask kUplink = 0x1000000000;
constexpr CommandMask kGetLagTimeout = 0x2000000000;
constexpr CommandMask kLoadLagTimeout = 0x4000000000;
constexpr CommandMask kSystem = 0x8000000000;
}  // namespace Bit

// The parser's result. Fields start as listed and are filled by the options
// (and, for switchName and numPorts, by the positional argument).
struct CommandOptions {
  CommandOptions();

  CommandMask mask = 0;
  std::string switchName;
  int32_t numPorts;  // starts as Portset::DEF_NUM_PORTS
  std::string uplinkName;
  std::string portGroupName;
  std::string cdpStatus = "print";
  std::string dvPortId;
  std::string portsetName;
  uint32_t lagId = 0;
  std::string timeoutUplinkName;
  std::string uuidText;
  std::string implClass;
  std::string dvsVersion;
  uint16_t mtu = 0;
  uint32_t vlanId = 0;
  int32_t maxActive = 0;
};

// Reads every option of argv left to right. Returns only when all were
// accepted, with `firstOperand` set to the index of the first operand left
// in argv; on any failure the process has ended (status 1, or 0 for -h).
CommandOptions ParseCommandLine(int argc, char** argv, int& firstOperand);

}  // namespace Cli
