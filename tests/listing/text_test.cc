// The text helpers: list joining and the UUID text form.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "hostctl/uuid_text.h"
#include "listing/text.h"

namespace {

using HostCtl::Misc::VectorToString;
using HostCtl::Text::IsValidUuidString;
using HostCtl::Text::UuidToString;

TEST(VectorToString, JoinsWithoutTrailingSeparator) {
  using Names = std::vector<std::string>;
  EXPECT_EQ(VectorToString(Names{}, ","), "");
  EXPECT_EQ(VectorToString(Names{"a", "b"}, ", "), "a, b");
  EXPECT_EQ(VectorToString(Names{"a", "b"}, nullptr), "a");
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
      {"00:11:22:33:44:55:66:77-88:99:aa:bb:cc:dd:ee:ff", false},
      {"00 11 22 33 44 55 66 77-88 99 aa bb cc dd ee gg", false},
      {"", false},
  };
  for (const auto& c : cases) EXPECT_EQ(IsValidUuidString(c.text), c.valid) << '"' << c.text << '"';
}

}  // namespace
