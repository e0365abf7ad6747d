// Names: what a name of each kind may be, and the names the running state
// must keep unique.
//
// Every name the host stores is 1 to N bytes of UTF-8 text without control
// characters (so no name can break a listing row or a trace line in two,
// or drive a terminal), and names that are printed joined by commas (pnics
// and uplinks, switches and portsets) hold no comma.
#pragma once

#include <optional>
#include <string>
#include <string_view>

namespace TarnCtl::Store {
class Db;
}

namespace TarnCtl::Model {

enum class NameKind {
  kSwitch,   // a standard, distributed or opaque switch
  kPortset,  // the portset name of a distributed or opaque switch
  kPnic,     // a physical NIC
  kUplink,   // a pnic named in a teaming order or a timeout record
  kPortGroup,
  kClient,       // a virtual NIC on a port group or DVPort
  kDVPort,       // a DVPort's port id
  kSwitchId,     // a distributed switch's switch id
  kFaultTarget,  // the object name a fault is restricted to
};

struct NameRule {
  const char* what;  // "Portgroup name"
  size_t maxBytes;
  bool commaFree;
};

const NameRule& RuleOf(NameKind kind);
// Refuses a name that breaks the rule of its kind.
void CheckName(NameKind kind, const std::string& name);
bool IsUtf8(std::string_view text);

// A portset of the running state: its kind and the name its object is
// found by (standard: the switch name; distributed and opaque: the switch
// name, while `portset` is the portset name).
enum class PortsetKind { kStandard, kDistributed, kOpaque };
struct PortsetName {
  PortsetKind kind;
  std::string name;
  std::string portset;
};

// The portset that `portset` names: a standard switch, or the portset name
// of a distributed or opaque switch.
std::optional<PortsetName> FindPortset(Store::Db& db, const std::string& portset);
// Refuses a name of `kind` (kSwitch or kPortset) that breaks the name rule
// or that a running switch or portset of any kind has taken.
void CheckNewSwitchName(Store::Db& db, NameKind kind, const std::string& name);

// The switch of the running state that uses `pnic` (standard, distributed
// or opaque), or nothing when it is free.
std::optional<std::string> PnicOwner(Store::Db& db, const std::string& pnic);
// Refuses a pnic that does not exist or that a running switch uses.
void CheckFreePnic(Store::Db& db, const std::string& pnic);
// Refuses to remove a pnic that does not exist, that a running switch
// uses, or that the stored configuration or the distributed switch cache
// links: a restore would link it again, and every link names a pnic.
void CheckRemovablePnic(Store::Db& db, const std::string& pnic);

}  // namespace TarnCtl::Model
