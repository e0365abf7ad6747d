// The two failover-order edits shared by -L/-U and -M/-N.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "commands/commands.h"
#include "hostctl/records.h"

namespace {

using HostCtl::Network::NicTeamingPolicy;
using Order = std::vector<std::string>;

struct TeamingCase {
  const char* name;
  bool orderSet;
  Order order;
  int32_t maxActive;
  std::string uplink;
  bool changed;
  Order expectedOrder;
  int32_t expectedMaxActive;
  std::string expectedStderr;
};

// Runs `edit` on the case's policy, with fields the edits have no business
// with set, and compares what it did.
void Check(const TeamingCase& c, bool (*edit)(const std::string&, NicTeamingPolicy&)) {
  SCOPED_TRACE(c.name);
  NicTeamingPolicy policy;
  policy.flags = c.orderSet ? NicTeamingPolicy::kUplinkOrderSet | 0x3 : 0x3;
  policy.balancing = 7;
  policy.failback = 1;
  policy.uplinkOrder = c.order;
  policy.maxActive = c.maxActive;
  testing::internal::CaptureStderr();
  const bool changed = edit(c.uplink, policy);
  EXPECT_EQ(testing::internal::GetCapturedStderr(), c.expectedStderr);
  EXPECT_EQ(changed, c.changed);
  EXPECT_EQ(policy.uplinkOrder, c.expectedOrder);
  EXPECT_EQ(policy.maxActive, c.expectedMaxActive);
  // Those fields survive the edits.
  EXPECT_EQ(policy.flags & 0x3, 0x3u);
  EXPECT_EQ(policy.balancing, 7);
  if (changed) {
    EXPECT_NE(policy.flags & NicTeamingPolicy::kUplinkOrderSet, 0u);
  }
}

TEST(AddUplinkToTeaming, InsertsBehindTheActiveUplinks) {
  const TeamingCase cases[] = {
      {"two active", true, {"a", "b", "c", "d"}, 2, "e", true, {"a", "b", "e", "c", "d"}, 3, ""},
      {"one active of two", true, {"a", "b"}, 1, "n", true, {"a", "n", "b"}, 2, ""},
      {"count beyond the list", true, {"a", "b"}, 8, "c", true, {"a", "b", "c"}, 3, ""},
      {"empty explicit order", true, {}, 0, "a", true, {"a"}, 1, ""},
      {"no active uplink", true, {"a", "b"}, 0, "c", true, {"c", "a", "b"}, 1, ""},
      {"negative count goes to the front", true, {"a", "b"}, -3, "c", true, {"c", "a", "b"}, 1, ""},
      {"order not set: starts afresh", false, {"a", "b"}, 2, "c", true, {"c"}, 1, ""},
      {"order not set: listed name is new", false, {"c"}, 1, "c", true, {"c"}, 1, ""},
      {"already present", true, {"a", "b"}, 1, "b", false, {"a", "b"}, 1, ""},
  };
  for (const auto& c : cases) Check(c, Commands::AddUplinkToTeaming);
}

TEST(RemoveUplinkFromTeaming, LowersTheCountOnlyForAnActiveUplink) {
  const TeamingCase cases[] = {
      {"active one", true, {"a", "b", "e", "c", "d"}, 3, "b", true, {"a", "e", "c", "d"}, 2, ""},
      {"standby one", true, {"a", "b", "e", "c", "d"}, 3, "c", true, {"a", "b", "e", "d"}, 3, ""},
      {"last active entry", true, {"a", "b", "c"}, 2, "b", true, {"a", "c"}, 1, ""},
      {"only uplink", true, {"a"}, 1, "a", true, {}, 0, ""},
      {"count beyond the list", true, {"a", "b"}, 5, "b", true, {"a"}, 4, ""},
      {"negative count", true, {"a", "b"}, -1, "a", true, {"b"}, -1, ""},
      {"absent", true, {"a", "b"}, 2, "z", false, {"a", "b"}, 2, "Not a valid pnic: z\n"},
      {"order not set", false, {"a", "b"}, 2, "a", false, {"a", "b"}, 2, ""},
  };
  for (const auto& c : cases) Check(c, Commands::RemoveUplinkFromTeaming);
}

}  // namespace
