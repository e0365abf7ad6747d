// Queries for the host's invariants (model/invariants.h): each finds the
// first row that breaks one, or nothing. They read whole tables: they are
// for checking a host that came from outside (a loaded dump), never for a
// library operation.
#pragma once

#include <optional>
#include <string>
#include <vector>

namespace TarnCtl::Store {
class Db;
}

namespace TarnCtl::Store::Checks {

// The offending row's values, as texts.
using Offender = std::optional<std::vector<std::string>>;

Offender PortGroupWithoutSwitch(Db& db);     // port group, switch, layer
Offender LinkWithoutSwitch(Db& db);          // pnic, switch, layer
Offender LinkOfUnknownPnic(Db& db);          // pnic, switch
Offender UplinkWithoutSwitch(Db& db);        // pnic, distributed switch, layer
Offender UplinkOfUnknownPnic(Db& db);        // pnic, distributed switch
Offender UplinkOnUnknownPort(Db& db);        // pnic, DVPort
Offender ClientOnUnknownPort(Db& db);        // client, DVPort
Offender OpaqueUplinkUnknown(Db& db);        // pnic, opaque switch
Offender PnicUsedTwice(Db& db);              // pnic (running state)
Offender SwitchNameUsedTwice(Db& db);        // name (running state)
Offender OverfullStandardSwitch(Db& db);     // switch, used ports, ports
Offender OverfullDistributedSwitch(Db& db);  // switch, DVPorts, ports
Offender EnsOnUnknownPortset(Db& db);        // portset

}  // namespace TarnCtl::Store::Checks
