// -l: the distributed switch table and its DVPorts.
#include <iostream>
#include <string>
#include <vector>

#include "hostctl/exception.h"
#include "hostctl/join.h"
#include "listing/layouts.h"
#include "listing/listing.h"
#include "listing/table.h"

namespace Listing {

using HostCtl::Lib::HostCtlException;

namespace {

// One DVPort row. The client shows only when the port has exactly one.
void ListDVPort(HostCtl::Network::DVPort& port) {
  const HostCtl::Network::DVPortParam param = port.GetParam();
  RowWriter row(std::cout, kDVPortLayout);
  row.Field(kGap);
  row.Field(param.portId);
  std::vector<std::string> clients;
  row.Field(port.IsInUse(clients) ? 1 : 0);
  if (clients.size() == 1) row.Field(clients.front());
  row.End();
}

}  // namespace

// A failing DVPort costs its own row; any other failure ends the block.
void ListDVSwitch(HostCtl::Network::DVSwitch& dvs) {
  PrintHeader(std::cout, kDVSwitchLayout);
  try {
    RowWriter row(std::cout, kDVSwitchLayout);
    row.Field(dvs.GetSwitchName());
    row.Field(kGap);
    row.Field(dvs.GetNumPorts());
    row.Field(dvs.GetUsedPorts());
    row.Field(dvs.GetConfiguredPorts());
    row.Field(dvs.GetMTU());
    row.Field(HostCtl::Text::Join(dvs.GetUplinks(), ","));
    row.End();

    PrintEmptyLine(std::cout);
    PrintHeader(std::cout, kDVPortLayout);
    // Asked for by the platform's listing protocol; nothing here reads it.
    dvs.GetDVPortParams();
    const auto ports = dvs.GetDVPorts();
    for (const auto& port : ports) {
      try {
        ListDVPort(*port);
      } catch (const HostCtlException& e) {
        std::cerr << "Listing failed for DVPort: " << port->GetPortId()
                  << " under DVSwitch: " << dvs.GetName() << ", Error: " << e.GetMessage()
                  << std::endl;
      }
    }
    PrintEmptyLine(std::cout);
  } catch (const HostCtlException& e) {
    std::cerr << "Listing failed for DVSwitch: " << dvs.GetName() << ", Error: " << e.GetMessage()
              << std::endl;
  }
}

}  // namespace Listing
