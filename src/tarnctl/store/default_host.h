// The host a new database holds, and what a new switch starts with.
//
// The default host: pnics pnic0..pnic3; the standard switch vswitch0
// (kDefaultPorts ports, MTU kDefaultMtu, CDP status kDefaultCdpStatus,
// teaming order [pnic0] with one active uplink) linked to pnic0; its port
// group Management (VLAN 0, no uplink order of its own). Switch, link and
// port group exist in both layers.
#pragma once

#include <cstdint>
#include <string>

namespace TarnCtl::Store {

// A new switch's ports (when none are given), MTU and CDP status (listen).
inline constexpr int32_t kDefaultPorts = 128;
inline constexpr uint32_t kDefaultMtu = 1500;
inline constexpr int32_t kDefaultCdpStatus = 1;

// SQL run on an empty schema: the meta rows of a host with nothing in it
// (the ordering counter and the ENS node flag), or with `objects` those
// and the default host's objects.
std::string HostSql(bool objects);

}  // namespace TarnCtl::Store
