// Administration of the simulated host: what the tool cannot do itself.
// Used by tarnhost. A Host holds the process's session (and with it the
// host's lock and one transaction) for its lifetime; each call applies the
// same rules the library applies and is undone whole when refused.
// Refusals throw HostCtl::Lib::HostCtlException with a message that says
// what and why.
#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "hostctl/exception.h"

namespace TarnCtl::Admin {

struct DVSwitchSeed {
  std::string name;
  std::optional<std::string> portset;   // default: the name
  std::optional<std::string> switchId;  // default: derived from the name, unique
  int32_t ports = 128;
  uint32_t mtu = 1500;
  std::vector<std::string> uplinks;  // pnics, must be free
};

struct DVPortSeed {
  std::string dvs;  // switch name
  std::string portId;
  std::vector<std::string> clients;
  uint32_t connectionId = 0;
};

struct OpaqueSeed {
  std::string name;
  std::optional<std::string> portset;  // default: the name
  int32_t ports = 128;
  int32_t used = 0;
  std::vector<std::string> uplinks;
};

struct FaultSeed {
  std::string operation;
  std::optional<std::string> on;  // object or argument name; none: any call
  std::optional<std::string> message;
  std::optional<std::string> detail;
  int64_t skip = 0;
  int64_t times = 1;
};

// A failure as people read it: a refusal's explanation, that is its
// detailed message without the operation's name in front ("Invalid number
// of ports 4097 (8-4096)"); a database failure's message; another's
// detailed message, or its message when it has none.
std::string Reason(const HostCtl::Lib::HostCtlException& failure);

// The host file that Host() opens, as the environment names it; refuses a
// mistaken name (TARN_HOST_DB starting with "~").
std::string HostPath();
// The log beside the host file at `path` when a commit waits there to be
// copied into the file; empty when none does.
std::string WaitingLog(const std::string& path);

// An operation of the host control library, for arming faults.
struct OperationInfo {
  std::string name;
  std::string target;  // what --on may name for it, in words
  bool faultable;      // false: it runs without the host and cannot fail
};
// Every operation of the library, in name order.
std::vector<OperationInfo> LibraryOperations();

// Reports progress of a long operation: rows done so far of `total`.
using Progress = std::function<void(int64_t done, int64_t total)>;

// What the host's lists hold (`tarnhost NOUN list`), one kind of object each.
enum class Listing {
  kPnics,           // name, running switch that uses it, stored switch that links it
  kClients,         // port group, client
  kSystemSwitches,  // name, ports, used ports, uplinks
  kDVSwitches,      // name, portset, switch id, ports, used ports, uplinks
  kOpaqueSwitches,  // name, portset, ports, used ports, uplinks
  kDVPorts,         // switch, port id, connection id, uplinks, then a field per client
  kTimeouts,        // "uplink" or "lag", portset, uplink, LAG id, timeout (stored records)
  kFaults,          // number, operation, object, skip, times, message, detail (quoted)
};
// A row of text fields per object; an empty field is none, and lists of
// pnics are joined by commas.
using ListRow = std::vector<std::string>;

// The host's objects whose names the completion offers.
enum class ObjectKind {
  kPnic,
  kFreePnic,  // that no switch uses
  kPortGroup,
  kSwitch,  // standard or distributed
  kSystemSwitch,
  kDVSwitch,
  kOpaqueSwitch,
  kPortset,  // standard switch names and the portsets of the others
  kObject,   // what a fault's --on names: switch, portset, port group or DVPort id
  kDVPort,   // port ids: of the switch named by the owner, or of any
  kClient,   // clients: of the port group named by the owner, or of any
  kFault,    // armed faults' numbers
};

class Host {
 public:
  Host();   // opens the host (creating the default one if missing)
  ~Host();  // commits
  Host(const Host&) = delete;
  Host& operator=(const Host&) = delete;

  // The host file.
  const std::string& Path() const;
  // Makes what was done so far durable; throws when it cannot.
  void Commit();

  // Replaces the host: the default host, or with `empty` nothing at all.
  void Init(bool empty);
  // Drops the running state, keeps the stored configuration.
  void Reboot();

  void AddPnic(const std::string& name);
  void AddClient(const std::string& portGroup, const std::string& client);
  void AddSystemSwitch(const std::string& name, int32_t ports);
  void AddDVSwitch(const DVSwitchSeed& seed);
  void AddDVPort(const DVPortSeed& seed);
  void AddOpaqueSwitch(const OpaqueSeed& seed);
  void AddUplinkTimeout(const std::string& portset, const std::string& uplink, uint32_t lagId,
                        uint32_t timeout);
  void AddLagTimeout(const std::string& portset, uint32_t lagId, uint32_t timeout);
  void AddFault(const FaultSeed& seed);
  void ClearFaults();

  // Removal refuses what the library would refuse (an object in use or that
  // something still names) and unknown objects.
  void RemovePnic(const std::string& name);
  void RemoveClient(const std::string& portGroup, const std::string& client);
  void RemoveSystemSwitch(const std::string& name);
  // From the running state and the cache, with its DVPorts.
  void RemoveDVSwitch(const std::string& name);
  void RemoveDVPort(const std::string& dvs, const std::string& portId);
  void RemoveOpaqueSwitch(const std::string& name);
  void RemoveUplinkTimeout(const std::string& portset, const std::string& uplink, uint32_t lagId);
  void RemoveLagTimeout(const std::string& portset, uint32_t lagId);
  // The fault of that number, as List(kFaults) shows it.
  void RemoveFault(int64_t number);

  // The objects of a list, in the order they were made.
  std::vector<ListRow> List(Listing what);
  // The names of `kind` (of `owner`, where the kind says so), read without
  // waiting for the host's lock and without creating a host, so that it
  // never blocks: none when the host is busy, missing or unreadable.
  static std::vector<std::string> PeekNames(ObjectKind kind, const std::string& owner = "");

  // The whole host as readable text: its file, the running state, the
  // stored configuration, ENS state, timeouts, armed faults.
  std::string Show();
  // The whole host as JSON for programs, or with `name` the standard
  // switch, distributed switch and port group of that name in both layers
  // (docs/host.md, "JSON"); refuses a name that is none of them.
  std::string ShowJson(const std::optional<std::string>& name = std::nullopt);
  // The whole host as a Graphviz graph (dot language).
  std::string ShowDot();
  // The whole host as JSON (stable key and row order, ending in a newline);
  // Load(Dump()) leaves a host whose Dump() is the same text.
  std::string Dump(const Progress& progress = nullptr);
  // Replaces the whole host with a dump; refuses a malformed or
  // inconsistent dump without changing anything. A `json` whose capacity
  // exceeds its size by kLoadRoom bytes is read in place, another from a
  // copy (which, for a large dump, doubles the memory the load touches).
  static constexpr size_t kLoadRoom = 64;
  void Load(const std::string& json, const Progress& progress = nullptr);

  struct State;

 private:
  explicit Host(std::unique_ptr<State> state);
  std::vector<std::string> Names(ObjectKind kind, const std::string& owner);

  std::unique_ptr<State> state_;
};

}  // namespace TarnCtl::Admin
