// The host a new database holds, as SQL run on an empty schema:
// pnics pnic0..pnic3; the standard switch vswitch0 (128 ports, MTU 1500,
// CDP status 1, teaming order [pnic0] with one active uplink) linked to
// pnic0; its port group Management (VLAN 0, no uplink order of its own).
// Switch, link and port group exist in both layers.
#pragma once

namespace TarnCtl::Store {

// Meta rows of a host with nothing in it: the ordering counter and the ENS
// node flag.
extern const char* const kEmptyHostSql;
// kEmptyHostSql plus the default host's objects.
extern const char* const kDefaultHostSql;

}  // namespace TarnCtl::Store
