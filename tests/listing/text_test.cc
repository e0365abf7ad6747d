// The text helpers: list joining, the edit distance and the UUID text form.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "hostctl/edit_distance.h"
#include "hostctl/join.h"
#include "hostctl/uuid_text.h"

namespace {

using HostCtl::Text::EditDistance;
using HostCtl::Text::IsValidUuidString;
using HostCtl::Text::Join;
using HostCtl::Text::UuidToString;

// An empty item keeps its place.
TEST(Join, PutsSeparatorsBetweenItemsOnly) {
  const struct {
    std::vector<std::string> items;
    const char* joined;
    const char* alternatives;
  } cases[] = {{{}, "", ""},
               {{"a"}, "a", "a"},
               {{"a", "b"}, "a,b", "a or b"},
               {{"a", "b", "c"}, "a,b,c", "a, b or c"},
               {{"", "b", ""}, ",b,", ", b or "}};
  for (const auto& c : cases) {
    EXPECT_EQ(Join(c.items, ","), c.joined);
    EXPECT_EQ(Join(c.items, ", ", " or "), c.alternatives);
  }
}

// In halves: a change of case is 1, any other edit (a swap of neighbours
// too) 2; the same both ways.
TEST(EditDistance, CountsEditsInHalves) {
  const struct {
    const char* a;
    const char* b;
    size_t halves;
  } cases[] = {
      {"dump", "dump", 0}, {"SetVlanID", "SetVlanId", 1}, {"getmtu", "GetMTU", 4},
      {"dumo", "dump", 2}, {"verison", "version", 2},     {"RemoveUplnk", "RemoveUplink", 2},
      {"", "add", 6},
  };
  for (const auto& c : cases) {
    EXPECT_EQ(EditDistance(c.a, c.b), c.halves) << c.a << " " << c.b;
    EXPECT_EQ(EditDistance(c.b, c.a), c.halves) << c.b << " " << c.a;
  }
}

// What it writes, IsValidUuidString accepts.
TEST(UuidToString, KeepsFifteenBytesAndZeroPads) {
  const struct {
    std::string text;
    const char* uuid;
  } cases[] = {
      {"abcdefghijklmnopqrstuvwxyz", "61 62 63 64 65 66 67 68-69 6a 6b 6c 6d 6e 6f 00"},
      {"abcdefghijklmn", "61 62 63 64 65 66 67 68-69 6a 6b 6c 6d 6e 00 00"},
      {"", "00 00 00 00 00 00 00 00-00 00 00 00 00 00 00 00"},
      {"\xff\x80z", "ff 80 7a 00 00 00 00 00-00 00 00 00 00 00 00 00"},
  };
  for (const auto& c : cases) {
    EXPECT_STREQ(UuidToString(c.text.c_str()), c.uuid) << c.text;
    EXPECT_TRUE(IsValidUuidString(c.uuid)) << c.text;
  }
}

TEST(IsValidUuidString, FollowsScanRules) {
  const struct {
    const char* text;
    bool valid;
  } cases[] = {
      {"00 11 22 33 44 55 66 77-88 99 aa bb cc dd ee ff", true},
      {"AA BB CC DD EE FF 00 11-22 33 44 55 66 77 88 99", true},
      {"0 1 2 3 4 5 6 7-8 9 a b c d e f", true},
      {"00 11 22 33 44 55 66 77- 88 99 aa bb cc dd ee ff", true},
      {"00 11 22 33 44 55 66 77-88 99 aa bb cc dd ee ffXYZ", true},
      {"  00\t11\n22 33 44 55 66 77-88 99 aa bb cc dd ee ff", true},
      {"00 11 22 33 44 55 66 77-88 99 aa bb cc dd ee", false},
      {"00 11 22 33 44 55 66 77 -88 99 aa bb cc dd ee ff", false},
      {"00:11:22:33:44:55:66:77-88:99:aa:bb:cc:dd:ee:ff", false},
      {"00 11 22 33 44 55 66 77-88 99 aa bb cc dd ee gg", false},
      {"", false},
  };
  for (const auto& c : cases) EXPECT_EQ(IsValidUuidString(c.text), c.valid) << '"' << c.text << '"';
}

}  // namespace
