// The call trace: one line per call, written when the call is entered, in
// the format of src/tarnctl/trace.h. (The node calls' lines: the ens
// transcript.)
#include "host_fixture.h"

namespace {

using TraceTest = HostTest;

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

}  // namespace
