// Armed failures: which calls a fault row matches, how skip and times count
// down, that the counts are kept across sessions and processes, and the
// node calls' own ways of failing.
#include "host_fixture.h"
#include "tarnctl/api/session.h"

namespace {

using TarnCtl::Admin::FaultSeed;

using FaultTest = HostTest;

FaultSeed Fault(const char* operation, std::optional<std::string> on = std::nullopt,
                int64_t skip = 0, int64_t times = 1) {
  return {operation, std::move(on), "armed", "armed in detail", skip, times};
}

// "P" when `call` passes, "F" when the armed fault fails it.
std::string Outcome(const std::function<void()>& call) {
  const std::string message = Refusal(call);
  return message.empty() ? "P" : message == "armed" ? "F" : "?" + message;
}

TEST_F(FaultTest, SkipAndTimesCountDown) {
  struct Case {
    int64_t skip, times;
    bool always, pass;
    const char* outcomes;
    int64_t fired;
  };
  const std::vector<Case> cases = {
      {0, 1, false, false, "FPPPP", 1}, {1, 2, false, false, "PFFPP", 2},
      {3, 1, false, false, "PPPFP", 1}, {0, 4, false, false, "FFFFP", 4},
      {1, 1, true, false, "PFFFF", 4},  {0, 2, false, true, "PPPPP", 2}};
  NetworkInfoImpl network;
  PortGroupImpl pg("Management");
  for (const Case& c : cases) {
    TarnCtl::Admin::ClearFaults(TarnCtl::Admin::Host().db());
    FaultSeed seed = Fault("SetVlanId", std::nullopt, c.skip, c.times);
    seed.always = c.always;
    seed.pass = c.pass;
    seed.delayMs = c.pass ? 1 : 0;
    Arm(seed);
    std::string outcomes;
    for (int i = 0; i < 5; ++i) outcomes += Outcome([&] { pg.SetVlanId(7); });
    EXPECT_EQ(outcomes, c.outcomes) << "skip " << c.skip << " times " << c.times;
    // A used-up fault stays, spent, with the count of calls it fired on.
    const auto faults = TarnCtl::Admin::Faults(TarnCtl::Admin::Host().db());
    ASSERT_EQ(faults.size(), 1u);
    EXPECT_EQ(faults[0].fired, c.fired) << "skip " << c.skip << " times " << c.times;
    EXPECT_EQ(TarnCtl::Store::Faults::Spent(faults[0]), !c.always) << c.outcomes;
  }
  // The row's texts are the exception's, and the first matching row fires.
  Arm({"GetVlanId", std::nullopt, "first", "first in detail", 0, 1});
  Arm({"GetVlanId", std::nullopt, "second", "second in detail", 0, 1});
  EXPECT_EQ(Refused([&] { pg.GetVlanId(); }),
            (std::pair<std::string, std::string>{"first", "first in detail"}));
  EXPECT_EQ(Refusal([&] { pg.GetVlanId(); }), "second");
}

// The transcripts fail pg, switch, DVPort and opaque portset targets; here
// the other kinds, and calls that a target must not catch.
TEST_F(FaultTest, ATargetMatchesTheObjectOrTheNameArgument) {
  SeedSampleHost();
  // Record functions check faults only within an open session, and open none.
  Arm(Fault("GetDefaultPolicy"));
  EXPECT_EQ(Outcome([] { HN::ShapingPolicy::GetDefaultPolicy(); }), "P");
  EXPECT_EQ(TarnCtl::Api::Session::Current(), nullptr);
  NetworkInfoImpl network;
  auto info = network.GetVirtualSwitchInfo();
  struct Case {
    FaultSeed fault;
    std::function<void()> call;
    const char* outcome;
  };
  auto dvsMtu = [] { Dvs("dvs0")->GetMTU(); };
  const std::vector<Case> cases = {
      {Fault("GetMTU", "vs1"), dvsMtu, "P"},
      {Fault("GetMTU", "dvs0"), dvsMtu, "F"},
      {Fault("GetMTU", "dvs0-ps"), dvsMtu, "F"},
      {Fault("GetVirtualSwitchById", "vs1"), [] { Switch("vswitch0"); }, "P"},
      {Fault("SwitchExists", "vs9"), [&] { info->SwitchExists("vs9"); }, "F"},
      {Fault("RemoveVirtualSwitch", "vs1"), [&] { info->RemoveVirtualSwitch("vs1"); }, "F"},
      {Fault("GetDefaultPolicy", "ShapingPolicy"), [] { HN::NicTeamingPolicy::GetDefaultPolicy(); },
       "P"},
      {Fault("GetDefaultPolicy", "ShapingPolicy"), [] { HN::ShapingPolicy::GetDefaultPolicy(); },
       "F"},
      {Fault("GetDefaultPolicy"), [] { HN::NicCapabilities::GetDefaultPolicy(); }, "F"},
      {Fault("SetMaxActiveUplinks"), [] { HN::NicTeamingPolicy().SetMaxActiveUplinks(1); }, "F"},
      {Fault("Refresh"), [&] { info->Refresh(); }, "F"},
  };
  TarnCtl::Admin::Host admin;
  for (const Case& c : cases) {
    TarnCtl::Admin::ClearFaults(admin.db());
    TarnCtl::Admin::AddFault(admin.db(), c.fault);
    EXPECT_EQ(Outcome(c.call), c.outcome) << c.fault.operation << " on " << c.fault.on.value_or("");
  }
}

TEST_F(FaultTest, CountsAreKeptAcrossSessionsAndProcesses) {
  Arm(Fault("GetNumPorts", std::nullopt, 1, 2));
  auto numPorts = [] {
    NetworkInfoImpl network;
    Switch("vswitch0")->GetNumPorts();
  };
  EXPECT_EQ(Outcome(numPorts), "P");
  EXPECT_EQ(TarnCtl::Api::Session::Current(), nullptr);
  EXPECT_EQ(Outcome(numPorts), "F");
  EXPECT_EQ(InChild([&] { return Outcome(numPorts) == "F" ? 0 : 1; }), 0);
  EXPECT_EQ(Outcome(numPorts), "P");
  // A fault armed while a session is open applies to its next call.
  NetworkInfoImpl network;
  auto vs0 = Switch("vswitch0");
  EXPECT_EQ(Outcome([&] { vs0->GetMTU(); }), "P");
  Arm(Fault("GetMTU"));
  EXPECT_EQ(Outcome([&] { vs0->GetMTU(); }), "F");
}

// Armed node faults: the ens transcript. Here the node calls' own refusals.
TEST_F(FaultTest, NodeCallsReportByStatus) {
  NODI_SigResult result;
  uint32_t info = 0;
  EXPECT_EQ(NODI_CheckSig(&result, 21, &info), TARN_OK);
  EXPECT_EQ(NODI_CheckSig(&result, 20, &info), TARN_VERSION_MISMATCH);
  EXPECT_EQ(TarnCtl::Api::Session::Current(), nullptr);  // held for the call only
  NODI_ParamList* list = TarnCtl::Util::SysinfoUtil::GetIntParamList(1, NODI_PARAM_LIST_INT);
  ASSERT_NE(list, nullptr);
  EXPECT_EQ(NODI_Set(NODI_NODE_net_ens_activate + 1, 0, list, 0, 0), TARN_NOT_FOUND);
  EXPECT_EQ(NODI_Set(NODI_NODE_net_ens_activate, 0, nullptr, 0, 0), TARN_BAD_PARAM);
  EXPECT_EQ(NODI_Set(NODI_NODE_net_ens_activate, 0, list, 0, 0), TARN_OK);
  NODI_ParamListDestroy(list);

  // A busy host makes the node calls fail, not throw.
  NetworkInfoImpl network;
  setenv("TARN_LOCK_TIMEOUT", "0", 1);
  EXPECT_EQ(InChild([] {
              NODI_SigResult r;
              return NODI_CheckSig(&r, 21, nullptr) == TARN_FAILURE ? 0 : 1;
            }),
            0);
}

}  // namespace
