// The operation registry, and the trace's refusal to hang or die on a bad
// trace file.
#include <sys/stat.h>

#include <fstream>

#include "scratch.h"
#include "tarnctl/instrument/call.h"
#include "tarnctl/instrument/operations.h"
#include "tarnctl/instrument/trace.h"
#include "tarnctl/store/faults.h"
#include "tarnctl/store/host_file.h"
#include "tarnctl/store/meta.h"

namespace {

using namespace TarnCtl::Instrument;

TEST(OperationsTest, LookupsFindEveryOperation) {
  const auto operations = Operations();
  for (size_t i = 0; i < operations.size(); ++i) {
    EXPECT_EQ(FindOperation(operations[i].name), &operations[i]);
    EXPECT_EQ(&Describe(static_cast<Op>(i)), &operations[i]);
  }
  EXPECT_EQ(FindOperation("SetVlanID"), nullptr);
  EXPECT_EQ(FindOperation("ZZZ"), nullptr);
  // A swap of neighbours is one edit: eStVlanId is SetVlanId, not GetVlanId.
  const struct {
    const char* given;
    const char* nearest;
  } cases[] = {
      {"eStVlanId", "SetVlanId"},      {"getmtu", "GetMTU"}, {"AddPortgroup", "AddPortGroup"},
      {"RemoveUplnk", "RemoveUplink"}, {"Frobnicate", ""},   {"", ""}};
  for (const auto& c : cases) {
    EXPECT_EQ(NearestOperation(c.given).value_or(""), c.nearest) << c.given;
  }
  EXPECT_EQ(FindOperation("SetTeamingPolicy")->targets, kStandardSwitch | kPortGroup);
  EXPECT_EQ(TargetText(kStandardSwitch | kPortGroup), "a standard switch or a port group");
}

// The table's checks refuse what would break the lookups.
TEST(OperationsTest, AMalformedEntryIsRefused) {
  static_assert(WellFormed({"NODI_Set", kNoTarget}));
  static_assert(!WellFormed({"", kNoTarget}));
  static_assert(!WellFormed({"Get MTU", kAnySwitch}));
  static_assert(!WellFormed({"1Refresh", kNoTarget}));
  static_assert(!WellFormed({"Destroy", kRecord, Access::kNone}));
}

TEST(OperationsTest, AnOperationIsTheFunctionItIsWrittenIn) {
  static_assert(
      IsFunction("void TarnCtl::Network::PortGroupImpl::SetVlanId(uint16_t)", "SetVlanId"));
  static_assert(
      IsFunction("TarnCtl::Network::PortGroupImpl::PortGroupImpl(const string&)", "PortGroupImpl"));
  static_assert(IsFunction("int NODI_CheckSig(NODI_SigResult*, int, uint32_t*)", "NODI_CheckSig"));
  // What clang writes: no space between a pointer or reference and the name.
  static_assert(
      IsFunction("const char *TARN_ReturnStatusToString(int)", "TARN_ReturnStatusToString"));
  static_assert(IsFunction("const Param &X::GetParam() const", "GetParam"));
  static_assert(IsFunction("const Param& X::GetParam() const", "GetParam"));
  static_assert(!IsFunction("void X::GetVlanIdentity()", "GetVlanId"));
  static_assert(!IsFunction("void X::SetVlanId", "SetVlanId"));
  static_assert(!IsFunction("int *X_SetVlanId(int)", "SetVlanId"));
  static_assert(!IsFunction("void X::ResetVlanId(int)", "SetVlanId"));
}

using SavepointTest = ScratchTest;

// What an operation that changes the host did is kept when it returns and
// undone when it throws; a fault that fails it is used up all the same.
TEST_F(SavepointTest, AChangingOperationIsKeptOrUndoneWhole) {
  auto host =
      TarnCtl::Store::HostFile::Open(TarnCtl::Store::Location::File(Path("host.db")), {0, true});
  TarnCtl::Store::Db& db = host->db();
  TarnCtl::Store::Transaction run(db);
  auto call = [&](Op op) { return Call(&db, op, Nothing(), [] { return std::string(); }); };
  const struct {
    Op op;
    bool throws;
    int64_t kept;  // changes kept of the one made
  } cases[] = {
      {TARN_OPERATION(SetVlanId), false, 1},
      {TARN_OPERATION(SetVlanId), true, 0},
      {TARN_OPERATION(NODI_Set), true, 0},
  };
  for (const auto& c : cases) {
    const int64_t before = TarnCtl::Store::Meta::NextSeq(db);
    try {
      const Call running = call(c.op);
      TarnCtl::Store::Meta::NextSeq(db);
      if (c.throws) throw std::runtime_error("failed");
    } catch (const std::runtime_error&) {
    }
    EXPECT_EQ(TarnCtl::Store::Meta::NextSeq(db) - before, 1 + c.kept)
        << Describe(c.op).name << (c.throws ? " throwing" : "");
  }
  TarnCtl::Store::Faults::Insert(db, {0, "SetMTU", std::nullopt, "injected", "", 0, 1});
  EXPECT_EQ(Refusal([&] { call(TARN_OPERATION(SetMTU)); }), "injected");
  EXPECT_EQ(Refusal([&] { call(TARN_OPERATION(SetMTU)); }), "");
  run.Commit();
}

using TraceTest = ScratchTest;

// A trace file that cannot be opened or written turns the trace off, with
// a line on standard error, and never blocks: a FIFO without a reader.
TEST_F(TraceTest, ABadTraceFileTurnsTheTraceOff) {
  ASSERT_EQ(mkfifo(Path("fifo").c_str(), 0644), 0);
  for (const std::string& path : {Path("fifo"), dir_, std::string("/dev/full")}) {
    testing::internal::CaptureStderr();
    ConfigureTrace(path.c_str());
    const bool on = TraceOn() && (WriteTraceLine("Refresh()"), TraceOn());
    const std::string said = testing::internal::GetCapturedStderr();
    EXPECT_FALSE(on) << path;
    EXPECT_EQ(said.rfind("Call trace " + path + ": cannot ", 0), 0u) << said;
    EXPECT_NE(said.find("calls are not traced\n"), std::string::npos) << said;
  }
  // A name cannot forge a second line: the target is escaped too.
  ConfigureTrace(Path("trace").c_str());
  {
    Call call(nullptr, TARN_OPERATION(GetVlanId), On("pg\nRemovePortGroup(\"x\") on vswitch0"),
              [] { return std::string(); });
  }
  ConfigureTrace(nullptr);
  EXPECT_EQ(ReadFile(Path("trace")),
            "GetVlanId() on pg\\nRemovePortGroup(\\\"x\\\") on vswitch0\n");
  // A line that a full disk cut short is not glued to the next program's.
  std::ofstream(Path("cut")) << "Networ";
  ConfigureTrace(Path("cut").c_str());
  WriteTraceLine("Refresh()");
  WriteTraceLine("Refresh()");
  ConfigureTrace(nullptr);
  EXPECT_EQ(ReadFile(Path("cut")), "Networ\nRefresh()\nRefresh()\n");
}

}  // namespace
