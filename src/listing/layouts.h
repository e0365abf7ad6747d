// Column layouts of the three switch tables and their sub-tables.
#pragma once

#include <array>

#include "listing/table.h"

namespace Listing {

inline constexpr std::array<Column, 7> kVirtualSwitchLayout = {{
    {"Switch Name", 15},
    {kGap, 2},
    {"Num Ports", 12},
    {"Used Ports", 12},
    {"Configured Ports", 18},
    {"MTU", 8},
    {"Uplinks", 10},
}};

inline constexpr std::array<Column, 6> kPortGroupLayout = {{
    {kGap, 2},
    {"PortGroup Name", 40},
    {kGap, 2},
    {"VLAN ID", 9},
    {"Used Ports", 12},
    {"Uplinks", 10},
}};

inline constexpr std::array<Column, 7> kDVSwitchLayout = {{
    {"DVS Name", 15},
    {kGap, 2},
    {"Num Ports", 12},
    {"Used Ports", 12},
    {"Configured Ports", 18},
    {"MTU", 8},
    {"Uplinks", 10},
}};

inline constexpr std::array<Column, 4> kDVPortLayout = {{
    {kGap, 2},
    {"DVPort ID", 40},
    {"In Use", 12},
    {"Client", 12},
}};

inline constexpr std::array<Column, 5> kOpaqueSwitchLayout = {{
    {"Switch Name", 15},
    {kGap, 2},
    {"Num Ports", 12},
    {"Used Ports", 12},
    {"Uplinks", 10},
}};

}  // namespace Listing
