// The fixed-width rows of the -l tables.
#include <gtest/gtest.h>

#include <sstream>
#include <string>

#include "listing/layouts.h"
#include "listing/table.h"

namespace {

using namespace Listing;

TEST(Table, HeaderLinesHaveTheFullWidthOfTheirLayout) {
  const struct {
    Layout layout;
    std::string line;
  } cases[] = {
      {kVirtualSwitchLayout,
       "Switch Name      Num Ports   Used Ports  Configured Ports  MTU     Uplinks   \n"},
      {kPortGroupLayout,
       "  PortGroup Name                            VLAN ID  Used Ports  Uplinks   \n"},
      {kDVSwitchLayout,
       "DVS Name         Num Ports   Used Ports  Configured Ports  MTU     Uplinks   \n"},
      {kDVPortLayout, "  DVPort ID                               In Use      Client      \n"},
      {kOpaqueSwitchLayout, "Switch Name      Num Ports   Used Ports  Uplinks   \n"},
  };
  for (const auto& c : cases) {
    std::ostringstream out;
    PrintHeader(out, c.layout);
    EXPECT_EQ(out.str(), c.line);
  }
}

TEST(Table, LongValuesPushTheRowAndShortRowsEndEarly) {
  std::ostringstream out;
  RowWriter row(out, kOpaqueSwitchLayout);
  row.Field(std::string("a-switch-name-of-20c"));
  row.Field(kGap);
  row.Field(4294967295u);
  row.End();
  EXPECT_EQ(out.str(), "a-switch-name-of-20c  4294967295  \n");
}

}  // namespace
