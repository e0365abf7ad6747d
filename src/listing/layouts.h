// Column layouts of the three switch tables and their sub-tables.
#pragma once

#include <array>
#include <string_view>

#include "listing/table.h"

namespace Listing {

// Standard and distributed switch rows differ only in the name header.
constexpr std::array<Column, 7> SwitchLayout(std::string_view nameHeader) {
  return {{
      {nameHeader, 15},
      {kGap, 2},
      {"Num Ports", 12},
      {"Used Ports", 12},
      {"Configured Ports", 18},
      {"MTU", 8},
      {"Uplinks", 10},
  }};
}

inline constexpr std::array<Column, 7> kVirtualSwitchLayout = SwitchLayout("Switch Name");
inline constexpr std::array<Column, 7> kDVSwitchLayout = SwitchLayout("DVS Name");

inline constexpr std::array<Column, 6> kPortGroupLayout = {{
    {kGap, 2},
    {"PortGroup Name", 40},
    {kGap, 2},
    {"VLAN ID", 9},
    {"Used Ports", 12},
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
