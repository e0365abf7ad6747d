// The call trace: one line per call, written when the call is entered, in
// the format of src/tarnctl/trace.h. (The node calls' lines: the ens
// transcript.)
#include <unistd.h>

#include <nlohmann/json.hpp>

#include "host_fixture.h"

namespace {

using TraceTest = HostTest;
using json = nlohmann::json;

constexpr const char* kDvs0Uuid = "64 76 73 30 00 00 00 00-00 00 00 00 00 00 00 00";

TEST_F(TraceTest, RepresentativeCallsAndTheirArguments) {
  StartTrace();
  {
    NetworkInfoImpl network;
    auto info = network.GetVirtualSwitchInfo();
    auto vs0 = Switch("vswitch0");
    HN::NicTeamingPolicy policy = vs0->GetTeamingPolicy();
    policy.uplinkOrder.push_back("pnic1");
    vs0->SetTeamingPolicy(policy);
    PortGroupImpl("Management").SetVlanId(10);
    // Refused (no name holds control characters), but traced escaped.
    EXPECT_THROW(vs0->AddPortGroup(std::string("a\"b\\c\n\t\x01\xc3\xa9", 10)),
                 HostCtl::Lib::HostCtlException);
    info->AddVirtualSwitch(HN::NicTeamingPolicy::GetDefaultPolicy(), {true, false, true},
                           {true, 1, 2, 3}, {4, 5}, "vs1", 64);
    DVPortImpl port({kDvs0Uuid, "100", 0});
    std::vector<std::string> clients;
    EXPECT_FALSE(port.IsValid());
    EXPECT_THROW(port.IsInUse(clients), HostCtl::Lib::HostCtlException);
  }
  NODI_ParamListDestroy(nullptr);
  const std::vector<std::string> expected = {
      "NetworkInfoImpl()",
      "GetVirtualSwitchInfo()",
      "GetVirtualSwitchById(\"vswitch0\", 0)",
      "GetTeamingPolicy() on vswitch0",
      "SetTeamingPolicy({16, 0, 0, {0, 0, 0, 0}, [\"pnic0\", \"pnic1\"], 1}) on vswitch0",
      "PortGroupImpl(\"Management\")",
      "SetVlanId(10) on Management",
      "AddPortGroup(\"a\\\"b\\\\c\\n\\t\\x01\xc3\xa9\") on vswitch0",
      "NicTeamingPolicy::GetDefaultPolicy()",
      "AddVirtualSwitch({16, 0, 0, {0, 0, 0, 0}, [], 0}, {true, false, true}, {true, 1, 2, 3}, "
      "{4, 5}, \"vs1\", 64)",
      std::string("DVPortImpl({\"") + kDvs0Uuid + "\", \"100\", 0})",
      "IsValid() on 100",
      "IsInUse(out) on 100",
      "NODI_ParamListDestroy(null)",
  };
  EXPECT_EQ(TraceLines(), expected);
}

TEST_F(TraceTest, ObjectsOfEachKindNameThemselves) {
  SeedSampleHost();
  EXPECT_FALSE(std::filesystem::exists(TracePath()));  // no trace without the variable
  StartTrace();
  NetworkInfoImpl network;
  auto info = network.GetVirtualSwitchInfo();
  info->GetOpaqueSwitches().at(0)->GetUsedPorts();
  NetworkFactory::GetDVSwitchByName("dvs0")->GetDVPorts().at(0)->GetPortId();
  const std::vector<std::string> expected = {
      "NetworkInfoImpl()",     "GetVirtualSwitchInfo()",      "GetOpaqueSwitches()",
      "GetUsedPorts() on op0", "GetDVSwitchByName(\"dvs0\")", "GetDVPorts() on dvs0",
      "GetPortId() on 100",
  };
  EXPECT_EQ(TraceLines(), expected);
}

// The JSON trace: the run's open record, then a record per call as it
// ends, with how it ended. (Whole runs, their end and a killed one:
// tarnhost.t.)
TEST_F(TraceTest, JsonRecordsTellHowEachCallEnded) {
  StartTrace();
  setenv("TARN_TRACE_FORMAT", "json", 1);
  Arm({"SetVlanId", "Management", "bad\xff\x01", {}, 0, 1});
  Arm({"GetMTU", {}, {}, {}, 0, 1, 1, true});
  Arm({"NODI_CheckSig", {}, "nodi", {}, 0, 1});
  {
    NetworkInfoImpl network;
    PortGroupImpl pg("Management");
    EXPECT_THROW(pg.SetVlanId(5), HostCtl::Lib::HostCtlException);
    EXPECT_THROW(pg.SetVlanId(5000), HostCtl::Lib::HostCtlException);
    EXPECT_EQ(Switch("vswitch0")->GetMTU(), 1500u);
    NODI_SigResult result;
    EXPECT_NE(NODI_CheckSig(&result, 21, nullptr), TARN_OK);
  }
  std::vector<std::string> calls;
  const auto lines = TraceLines();
  ASSERT_FALSE(lines.empty());
  const auto open = nlohmann::json::parse(lines[0]);
  EXPECT_EQ(open["event"], "open");
  EXPECT_EQ(open["pid"], getpid());
  for (const std::string& line : lines) {
    const auto record = nlohmann::json::parse(line);
    if (record["event"] != "call" || record["operation"] == "NetworkInfoImpl") continue;
    calls.push_back(record["operation"].get<std::string>() + " " +
                    record["arguments"].get<std::string>() + " " + record["on"].dump() + " " +
                    record["outcome"].get<std::string>() + " " +
                    record.value("fault", json(0)).dump() + " " +
                    record.value("message", json("-")).get<std::string>());
  }
  const std::vector<std::string> expected = {
      "PortGroupImpl \"Management\" null ok 0 -",
      "SetVlanId 5 \"Management\" fault 1 bad\xef\xbf\xbd\x01",
      "SetVlanId 5000 \"Management\" refused 0 VLAN id 5000 is out of range",
      "GetVirtualSwitchById \"vswitch0\", 0 null ok 0 -",
      "GetMTU  \"vswitch0\" ok 2 -",
      "NODI_CheckSig out, 21, out null fault 3 nodi",
  };
  EXPECT_EQ(calls, expected);
}

}  // namespace
