// The host's lists for scripts (`tarnhost NOUN list`) and the names that
// completion offers, each drawn from its object's home.
#pragma once

#include <string>
#include <vector>

#include "tarnctl/admin/view.h"

namespace TarnCtl::Store {
class Db;
}

namespace TarnCtl::Admin {

// What the host's lists hold, one kind of object each (the fields: the
// object's List function).
enum class Listing {
  kPnics,
  kClients,
  kSystemSwitches,
  kDVSwitches,
  kOpaqueSwitches,
  kDVPorts,
  kTimeouts,
  kFaults,
  kArmedFaults,  // without the spent ones
};
// The objects of a list, in the order they were made.
std::vector<ListRow> List(Store::Db& db, Listing what);

// The host's objects whose names the completion offers.
enum class ObjectKind {
  kPnic,
  kFreePnic,  // that no switch uses
  kPortGroup,
  kSwitch,  // standard or distributed
  kSystemSwitch,
  kDVSwitch,
  kOpaqueSwitch,
  kPortset,   // standard switch names and the portsets of the others
  kObject,    // what a fault's --on names: switch, portset, port group or DVPort id
  kShowable,  // what show NAME shows: switch of any kind, port group, DVS:PORTID
  kDVPort,    // port ids: of the switch named by the owner, or of any
  kClient,    // clients: of the port group named by the owner, or of any
  kFault,     // armed faults' numbers
};
// The names of `kind` (of `owner`, where the kind says so), each once.
std::vector<std::string> Names(Store::Db& db, ObjectKind kind, const std::string& owner = "");
// The same of the host the environment names, read without waiting for
// its lock and without creating a host, so that it never blocks: none when
// the host is busy, missing or unreadable.
std::vector<std::string> PeekNames(ObjectKind kind, const std::string& owner = "");

}  // namespace TarnCtl::Admin
