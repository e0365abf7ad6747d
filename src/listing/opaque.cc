// -l: the opaque switch table, a single row per switch.
#include <iostream>

#include "hostctl/exception.h"
#include "hostctl/join.h"
#include "listing/layouts.h"
#include "listing/listing.h"
#include "listing/table.h"

namespace Listing {

void ListOpaqueSwitch(HostCtl::Network::DVSwitch& sw) {
  PrintHeader(std::cout, kOpaqueSwitchLayout);
  try {
    RowWriter row(std::cout, kOpaqueSwitchLayout);
    row.Field(sw.GetSwitchName());
    row.Field(kGap);
    row.Field(sw.GetNumPorts());
    row.Field(sw.GetUsedPorts());
    row.Field(HostCtl::Text::Join(sw.GetUplinks(), ","));
    row.End();
    PrintEmptyLine(std::cout);
  } catch (const HostCtl::Lib::HostCtlException& e) {
    std::cerr << "Listing failed for opaque switch: " << sw.GetName()
              << ", Error: " << e.GetMessage() << std::endl;
  }
}

}  // namespace Listing
