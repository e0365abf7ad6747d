// -l: the listing driver and the standard switch table.
#include <cstddef>
#include <iostream>
#include <string>

#include "hostctl/exception.h"
#include "hostctl/join.h"
#include "listing/layouts.h"
#include "listing/listing.h"
#include "listing/table.h"

namespace Listing {

using HostCtl::Lib::HostCtlException;
using HostCtl::Network::NicTeamingPolicy;

int ListAllSwitches(HostCtl::Network::VirtualSwitchInfo& info, bool system) {
  int listed = 0;
  const auto switches = info.GetVirtualSwitches(system);
  for (const auto& sw : switches) {
    ++listed;
    ListVirtualSwitch(*sw);
  }
  if (!system) {
    const auto dvSwitches = info.GetDVSwitches();
    for (const auto& dvs : dvSwitches) {
      ++listed;
      ListDVSwitch(*dvs);
    }
    const auto opaqueSwitches = info.GetOpaqueSwitches();
    for (const auto& opaque : opaqueSwitches) {
      ++listed;
      ListOpaqueSwitch(*opaque);
    }
  }
  return listed == 0 ? 1 : 0;
}

namespace {

// One port group row. The port group's own uplink order shows only when it
// has one.
void ListPortGroup(HostCtl::Network::PortGroup& group) {
  const std::size_t usedPorts = group.GetPorts().size();
  const NicTeamingPolicy policy = group.GetTeamingPolicy();
  const std::string uplinks = (policy.flags & NicTeamingPolicy::kUplinkOrderSet) != 0
                                  ? HostCtl::Text::Join(policy.uplinkOrder, ",")
                                  : std::string();
  RowWriter row(std::cout, kPortGroupLayout);
  row.Field(kGap);
  row.Field(group.GetName());
  row.Field(kGap);
  row.Field(group.GetVlanId());
  row.Field(usedPorts);
  row.Field(uplinks);
  row.End();
}

}  // namespace

// A failing port group costs its own row; any other failure ends the block.
void ListVirtualSwitch(HostCtl::Network::VirtualSwitch& sw) {
  PrintHeader(std::cout, kVirtualSwitchLayout);
  try {
    const NicTeamingPolicy policy = sw.GetTeamingPolicy();
    RowWriter row(std::cout, kVirtualSwitchLayout);
    row.Field(sw.GetName());
    row.Field(kGap);
    row.Field(sw.GetNumPorts());
    row.Field(sw.GetUsedPorts());
    row.Field(sw.GetConfiguredPorts());
    row.Field(sw.GetMTU());
    row.Field(HostCtl::Text::Join(policy.uplinkOrder, ","));
    row.End();

    PrintEmptyLine(std::cout);
    PrintHeader(std::cout, kPortGroupLayout);
    const auto groups = sw.GetPortGroups();
    for (const auto& group : groups) {
      try {
        ListPortGroup(*group);
      } catch (const HostCtlException& e) {
        std::cerr << "Listing failed for portgroup: " << group->GetName()
                  << " under vswitch: " << sw.GetName() << ", Error: " << e.GetMessage()
                  << std::endl;
      }
    }
    PrintEmptyLine(std::cout);
  } catch (const HostCtlException& e) {
    std::cerr << "Listing failed for vswitch: " << sw.GetName() << ", Error: " << e.GetMessage()
              << std::endl;
  }
}

}  // namespace Listing
