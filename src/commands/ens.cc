// ENS control: the host-wide activation node, activation and deactivation on
// a portset, and uplink reassociation with the optional device manager
// signal.
#include <signal.h>
#include <sys/types.h>

#include <cstdint>
#include <fstream>
#include <limits>
#include <optional>
#include <string>

#include "commands/commands.h"
#include "hostctl/nodi.h"
#include "hostctl/tarnctl.h"

namespace Commands {
namespace {

constexpr const char kDeviceManagerPidFile[] = "/var/run/halden/tarndevmgr.pid";
constexpr const char kPidMaxFile[] = "/proc/sys/kernel/pid_max";
// Version argument of the node interface's signature check.
constexpr int kNodiSigVersion = 21;

// The unsigned decimal number at the start of a file, after white space;
// what follows its digits is not looked at. Nothing when no digit comes
// first (a sign included) or when the digits go beyond 32 bits.
std::optional<uint32_t> ReadDecimal(std::istream& in) {
  in >> std::ws;
  uint64_t value = 0;
  bool digits = false;
  for (int c = in.peek(); c >= '0' && c <= '9'; c = in.peek()) {
    in.get();
    digits = true;
    // Once beyond 32 bits it stays there; the digits are still consumed.
    if (value <= std::numeric_limits<uint32_t>::max()) value = value * 10 + (c - '0');
  }
  if (!digits || value > std::numeric_limits<uint32_t>::max()) return std::nullopt;
  return static_cast<uint32_t>(value);
}

// One above the largest process id of this system; when the kernel does not
// say, every value that stays positive as a pid_t.
uint64_t PidLimit() {
  uint64_t limit = static_cast<uint64_t>(std::numeric_limits<pid_t>::max()) + 1;
  std::ifstream in(kPidMaxFile);
  const std::optional<uint32_t> pidMax = ReadDecimal(in);
  if (pidMax && *pidMax > 0 && *pidMax < limit) limit = *pidMax;
  return limit;
}

}  // namespace

void ActivateEnsNode() {
  NODI_SigResult result;
  uint32_t info = 0;
  const int status = NODI_CheckSig(&result, kNodiSigVersion, &info);
  if (status != 0) {
    throw Failure{1, std::string("NODI_CheckSig failed: ") + TARN_ReturnStatusToString(status)};
  }
  NODI_ParamList* params = TarnCtl::Util::SysinfoUtil::GetIntParamList(1, NODI_PARAM_LIST_INT);
  if (params == nullptr) {
    throw Failure{1, "Error, failed to create NODI parameter list."};
  }
  // Setting the node is best effort: its status is not examined.
  NODI_Set(NODI_NODE_net_ens_activate, 0, params, 0, 0);
  NODI_ParamListDestroy(params);
}

void ActivateEnsOnPortset(HostCtl::Network::Portset& portset, bool intr, bool fastSwitch) {
  ActivateEnsNode();
  portset.ActivateEns(intr, fastSwitch);
}

void DeactivateEnsOnPortset(HostCtl::Network::Portset& portset) {
  portset.DeactivateEns();
}

void SignalDeviceManager() {
  uint32_t pid = 0;
  {
    std::ifstream in(kDeviceManagerPidFile);
    if (!in.is_open()) {
      throw Failure{1, std::string("Failed to open ") + kDeviceManagerPidFile, true};
    }
    pid = ReadDecimal(in).value_or(0);
  }
  // 0 would signal our own process group; values at or above the limit name
  // no single process (and may turn negative as a pid_t).
  if (pid == 0 || pid >= PidLimit()) {
    throw Failure{1, "Failed to read device manager PID", true};
  }
  // Fire and forget: the daemon is not waited for.
  kill(static_cast<pid_t>(pid), SIGHUP);
}

void ReassociateEns(HostCtl::Network::Portset& portset, bool force) {
  const bool mode = portset.GetEnsMode();
  portset.ReassociateEnsUplinks(mode, force, 0, 0);
}

}  // namespace Commands
