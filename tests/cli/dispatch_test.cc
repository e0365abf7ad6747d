// Runs of the whole front end in this process: each ends with its status
// and line; and the command sets the argument checks take from the steps.
#include <gtest/gtest.h>

#include "cli/checks.h"
#include "cli/dispatch.h"
#include "host_fixture.h"

namespace {

// The status and standard error of one run of the tool with `args`.
std::pair<int, std::string> RunTool(std::vector<std::string> args) {
  args.insert(args.begin(), "orvocfg-vswitch");
  std::vector<char*> argv;
  for (std::string& arg : args) argv.push_back(arg.data());
  argv.push_back(nullptr);
  const int argc = static_cast<int>(args.size());
  int firstOperand = 0;
  Cli::CommandOptions options = Cli::ParseCommandLine(argc, argv.data(), firstOperand);
  testing::internal::CaptureStderr();
  const int status = Cli::RunCommands(options, argc, argv.data(), firstOperand);
  return {status, testing::internal::GetCapturedStderr()};
}

// In order, on one host: each run sees what the runs before it left.
TEST_F(HostTest, EveryRunEndsWithItsStatusAndLine) {
  NetworkInfoImpl create;  // the default host, before any capture
  const std::pair<std::vector<std::string>, std::pair<int, std::string>> runs[] = {
      // A failed lookup of -M says the short message, of -L the detailed one.
      {{"-M", "pnic0", "-p", "Management", "nosuch"},
       {1, "Virtual switch nosuch does not exist\n"}},
      {{"-L", "pnic0", "nosuch"},
       {1, "GetVirtualSwitchById: Virtual switch nosuch does not exist on this host\n"}},
      {{"-a", "vs1"}, {0, ""}},
      {{"-M", "pnic0", "-p", "vs1", "vswitch0"}, {1, "Unknown portgroup vs1\n"}},
      {{"-M", "pnic0", "-p", "Management", "vswitch0"}, {0, ""}},
  };
  for (const auto& [args, result] : runs) {
    SCOPED_TRACE(testing::PrintToString(args));
    EXPECT_EQ(RunTool(args), result);
  }
  EXPECT_TRUE(NetworkInfoImpl().GetVirtualSwitchInfo()->SwitchExists("vs1"));
  EXPECT_EQ(PortGroupImpl("Management").GetTeamingPolicy().uplinkOrder,
            std::vector<std::string>{"pnic0"});
}

// A new command that needs any of these changes its value here.
TEST(CommandSets, TakenFromTheStepTable) {
  EXPECT_EQ(Cli::kSwitchNameCommands, 0x2e0ffddbu);
  EXPECT_EQ(Cli::kLengthExemptCommands, 0x30000u);
  EXPECT_EQ(Cli::kPortGroupCommands, 0xc400u);
  EXPECT_EQ(Cli::kDVPortCommands, 0x32000u);
}

}  // namespace
