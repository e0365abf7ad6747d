// The option loop: bits, fields, conversions and getopt_long conventions.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "cli/options.h"

namespace {

using Cli::CommandMask;
using Cli::CommandOptions;
using Args = std::vector<std::string>;

constexpr const char kUuid[] = "00 11 22 33 44 55 66 77-88 99 aa bb cc dd ee ff";

struct Parsed {
  CommandOptions options;
  int firstOperand = 0;
  Args operands;
};

Parsed Parse(const Args& args) {
  Args words{"orvocfg-vswitch"};
  words.insert(words.end(), args.begin(), args.end());
  std::vector<char*> argv;
  for (std::string& word : words) argv.push_back(word.data());
  argv.push_back(nullptr);
  const int argc = static_cast<int>(words.size());
  Parsed parsed;
  parsed.options = Cli::ParseCommandLine(argc, argv.data(), parsed.firstOperand);
  for (int i = parsed.firstOperand; i < argc; ++i) parsed.operands.push_back(argv[i]);
  return parsed;
}

std::string Show(const Args& args) {
  return testing::PrintToString(args);
}

TEST(ParseCommandLine, EveryOptionSetsItsBitByLetterAndByName) {
  const struct {
    Args shortForm, longForm;
    CommandMask mask;
  } cases[] = {
      {{"-a"}, {"--add"}, 0x1},
      {{"-a", "-W"}, {"--add", "--dvswitch"}, 0x200001},
      {{"-d", "-W"}, {"--delete", "--dvswitch"}, 0x200002},
      {{"-a", "-W", "-u", kUuid}, {"--add", "--dvswitch", "--uuid", kUuid}, 0x600001},
      {{"-a", "-W", "-I", "c"}, {"--add", "--dvswitch", "--impl-class=c"}, 0xa00001},
      {{"-a", "-W", "-n", "6"}, {"--add", "--dvswitch", "--version=6"}, 0x1200001},
      {{"-l", "-S"}, {"--list", "--system"}, 0x8000000004},
      {{"-L", "p"}, {"--link=p"}, 0x8},
      {{"-U", "p"}, {"--unlink", "p"}, 0x10},
      {{"-R"}, {"--restore-uplinks"}, 0x100000},
      {{"-r"}, {"--restore"}, 0x20},
      {{"-Apg"}, {"--add-pg=pg"}, 0x40},
      {{"-D", "pg"}, {"--del-pg=pg"}, 0x80},
      {{"-C", "pg"}, {"--check-pg=pg"}, 0x200},
      {{"-c"}, {"--check"}, 0x100},
      {{"-p", "pg", "-V", "1"}, {"--pg=pg", "--dvp=1"}, 0},
      {{"-v", "1"}, {"--vlan=1"}, 0x400},
      {{"-B", "down"}, {"--set-cdp=down"}, 0x800},
      {{"-b"}, {"--get-cdp"}, 0x800},
      {{"-M", "u"}, {"--add-pg-uplink=u"}, 0x4000},
      {{"-N", "u"}, {"--del-pg-uplink=u"}, 0x8000},
      {{"-P", "u"}, {"--add-dvp-uplink=u"}, 0x10000},
      {{"-Q", "u"}, {"--del-dvp-uplink=u"}, 0x20000},
      {{"-m", "1500"}, {"--mtu=1500"}, 0x1000},
      {{"-X", "2"}, {"--set-maxactive=2"}, 0x80000},
      {{"-x"}, {"--get-maxactive"}, 0x40000},
      {{"-T"}, {"--test-sync-nota"}, 0x2000},
      {{"-y", "-i", "-F"}, {"--activate-ens", "--intr", "--fast-switch"}, 0xc2000000},
      {{"-Y"}, {"--deactivate-ens"}, 0x4000000},
      {{"-z"}, {"--reassociate-ens"}, 0x8000000},
      {{"-Z"}, {"--ens-ready"}, 0x10000000},
      {{"-f"}, {"--force-reassociate-ens"}, 0x20000000},
      {{"-O"}, {"--load-lacp-timeout"}, 0x200000000},
      {{"-o", "-s", "ps", "-j", "1", "-k", "u"},
       {"--get-lacp-timeout", "--portset=ps", "--lagid=1", "--uplink=u"},
       0x1d00000000},
      {{"-g"}, {"--get-lag-timeout"}, 0x2000000000},
      {{"-G"}, {"--load-lag-timeout"}, 0x4000000000},
      // The ENS options are not commands: they may follow one.
      {{"-a", "-y", "-Y", "-z", "-f"},
       {"--add", "--activate-ens", "--deactivate-ens", "--reassociate-ens",
        "--force-reassociate-ens"},
       0x2e000001},
  };
  for (const auto& c : cases) {
    EXPECT_EQ(Parse(c.shortForm).options.mask, c.mask) << Show(c.shortForm);
    EXPECT_EQ(Parse(c.longForm).options.mask, c.mask) << Show(c.longForm);
  }
}

// Those the transcripts do not show: an argument joined to its letter, and
// the last of the options naming a port group.
TEST(ParseCommandLine, StoresStringArgumentsLastOneWins) {
  const struct {
    Args args;
    std::string CommandOptions::*field;
    const char* value;
  } cases[] = {
      {{"-Lpnic1"}, &CommandOptions::uplinkName, "pnic1"},
      {{"-p", "a", "-A", "b"}, &CommandOptions::portGroupName, "b"},
      {{"-M", "u", "-p", "a", "--pg", "c"}, &CommandOptions::portGroupName, "c"},
  };
  for (const auto& c : cases) EXPECT_EQ(Parse(c.args).options.*c.field, c.value) << Show(c.args);
}

// Readers of the numeric fields, for the table below.
constexpr auto Vlan = [](const CommandOptions& o) -> int64_t { return o.vlanId; };
constexpr auto MaxActive = [](const CommandOptions& o) -> int64_t { return o.maxActive; };
constexpr auto Mtu = [](const CommandOptions& o) -> int64_t { return o.mtu; };
constexpr auto LagId = [](const CommandOptions& o) -> int64_t { return o.lagId; };

// Beyond what the transcripts convert (-v 0x10, -v 4095, -X 3, -X -2,
// --lagid=0x10, -j abc).
TEST(ParseCommandLine, ConvertsNumbersInAutomaticBase) {
  const struct {
    Args args;
    int64_t (*field)(const CommandOptions&);
    int64_t value;
  } cases[] = {
      {{"-v", "010"}, Vlan, 8},        {{"-v", ""}, Vlan, 0},
      {{"-v", " 7"}, Vlan, 7},         {{"-v", "4294967296"}, Vlan, 0},
      {{"-X", "0x10"}, MaxActive, 16}, {{"-X", ""}, MaxActive, 0},
      {{"-m", "70000"}, Mtu, 4464},    {{"-m", "abc"}, Mtu, 0},
      {{"-m", "9000x"}, Mtu, 9000},    {{"-o", "-j", "7abc"}, LagId, 7},
  };
  for (const auto& c : cases) EXPECT_EQ(c.field(Parse(c.args).options), c.value) << Show(c.args);
}

TEST(ParseCommandLine, LeavesOperandsBehindTheOptions) {
  const struct {
    Args args;
    CommandMask mask;
    int firstOperand;
    Args operands;
  } cases[] = {
      {{}, 0, 1, {}},
      {{"-L", "p", "vs0", "x"}, 0x8, 3, {"vs0", "x"}},
      {{"vs0", "-a"}, 0x1, 2, {"vs0"}},
      {{"-a", "--", "-d"}, 0x1, 3, {"-d"}},
      {{"-ay", "vs1"}, 0x2000001, 2, {"vs1"}},
  };
  for (const auto& c : cases) {
    const Parsed parsed = Parse(c.args);
    EXPECT_EQ(parsed.options.mask, c.mask) << Show(c.args);
    EXPECT_EQ(parsed.firstOperand, c.firstOperand) << Show(c.args);
    EXPECT_EQ(parsed.operands, c.operands) << Show(c.args);
  }
}

}  // namespace
