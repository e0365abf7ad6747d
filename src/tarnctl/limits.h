// The ranges the simulated host accepts; a value outside them is refused
// with a HostCtlException that names the value and the range.
#pragma once

#include <cstdint>

namespace TarnCtl::Detail {

// Ports of a standard or distributed switch.
constexpr int32_t kMinPorts = 8;
constexpr int32_t kMaxPorts = 4096;
// MTU of any switch; a new switch starts with kDefaultMtu.
constexpr uint32_t kMinMtu = 1280;
constexpr uint32_t kMaxMtu = 9000;
constexpr uint32_t kDefaultMtu = 1500;
// VLAN ids of a port group (0: no VLAN).
constexpr uint32_t kMaxVlanId = 4095;
// Port group names: 1 to this many bytes, unique on the host.
constexpr size_t kMaxPortGroupName = 127;
// Switch and portset names: 1 to MAX_VSNAME_SZ - 1 bytes, unique among all
// portsets (standard switches, distributed switch and portset names, opaque
// switch and portset names).
// CDP status: 0 down, 1 listen (a new switch's), 2 advertise, 3 both.
constexpr int32_t kMaxCdpStatus = 3;
constexpr int32_t kDefaultCdpStatus = 1;
// Teaming policies: maxActive >= 0; an uplink order names no pnic twice
// (it may name pnics that are not linked).
// DVSwitch versions: >= 0. Implementation classes: "cswitch", "etherswitch".

}  // namespace TarnCtl::Detail
