// Runs of the whole front end in this process, on a host of the test's own:
// the run status and the line that ends it; and the command sets that the
// argument checks take from the step table.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "cli/checks.h"
#include "cli/dispatch.h"
#include "hostctl/tarnctl.h"
#include "scratch.h"

namespace {

class RunCommandsTest : public ScratchTest {
 protected:
  void SetUp() override {
    ScratchTest::SetUp();
    unsetenv("TARN_TRACE");
    setenv("TARN_HOST_DB", Path("host.db").c_str(), 1);
    TarnCtl::Network::NetworkInfoImpl create;  // the default host, before any capture
  }
  void TearDown() override {
    unsetenv("TARN_HOST_DB");
    ScratchTest::TearDown();
  }

  // The status and standard error of one run of the tool with `args`.
  static std::pair<int, std::string> Run(std::vector<std::string> args) {
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
};

// In order, on one host: each run sees what the runs before it left.
TEST_F(RunCommandsTest, EveryRunEndsWithItsStatusAndLine) {
  const struct {
    std::vector<std::string> args;
    int status;
    std::string stderrText;
  } runs[] = {
      {{"-d", "nosuch"}, 1, "Not a valid virtual switch or it is a DVSwitch: nosuch\n"},
      {{"-M", "pnic0", "-p", "nosuch", "vswitch0"}, 1, "Unknown portgroup nosuch\n"},
      // A failed lookup of -M says the short message, of -L the detailed one.
      {{"-M", "pnic0", "-p", "Management", "nosuch"}, 1, "Virtual switch nosuch does not exist\n"},
      {{"-L", "pnic0", "nosuch"},
       1,
       "GetVirtualSwitchById: Virtual switch nosuch does not exist on this host\n"},
      {{"-a", "vs1"}, 0, ""},
      {{"-A", "pg1", "vs1"}, 0, ""},
      {{"-M", "pnic0", "-p", "pg1", "vswitch0"},
       1,
       "Portgroup (pg1) does not exist on switch: vswitch0\n"},
      {{"-M", "pnic3", "-p", "Management", "vswitch0"},
       1,
       "Uplink (pnic3) does not exist on the switch: vswitch0\n"},
      {{"-M", "pnic0", "-p", "Management", "vswitch0"}, 0, ""},
      {{"-a", "-W", "-I", "etherswitch", "-n", "6", "dvs1"},
       1,
       "Implementation class etherswitch cannot be                backed by DVS 6.6\n"},
      {{"-a", "-W", "-I", "cswitch", "-n", "5", "dvs1"},
       1,
       "Implementation class cswitch can be backed                only from DVS 6.6\n"},
      {{"-a", "-W", "dvs1"}, 0, ""},
      {{"-P", "pnic1", "-V", "999", "dvs1"}, 1, "Invalid DVPort params 999\n"},
      {{"-T", "-V", "7", "dvs1"}, 1, "Invalid DVPort params 7\n"},
  };
  for (const auto& run : runs) {
    SCOPED_TRACE(testing::PrintToString(run.args));
    EXPECT_EQ(Run(run.args), std::make_pair(run.status, run.stderrText));
  }
  // What the runs that went through did.
  TarnCtl::Network::NetworkInfoImpl network;
  EXPECT_TRUE(network.GetVirtualSwitchInfo()->SwitchExists("vs1"));
  EXPECT_EQ(TarnCtl::Network::PortGroupImpl("Management").GetTeamingPolicy().uplinkOrder,
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
