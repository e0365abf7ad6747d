// Each operation shows that it applies its rules (their bounds and wording:
// the model test): a short message, a detailed one that starts with the
// operation's name, and the host unchanged.
#include "host_fixture.h"

namespace {

using RefusalTest = HostTest;

HN::NicTeamingPolicy Policy(std::vector<std::string> order, int32_t maxActive) {
  HN::NicTeamingPolicy policy;
  policy.flags = HN::NicTeamingPolicy::kUplinkOrderSet;
  policy.uplinkOrder = std::move(order);
  policy.maxActive = maxActive;
  return policy;
}

std::unique_ptr<HN::VirtualSwitch> AddSwitch(HN::VirtualSwitchInfo& info, const std::string& name,
                                             int32_t ports,
                                             HN::NicTeamingPolicy teaming = Policy({}, 0)) {
  return info.AddVirtualSwitch(teaming, {}, {}, {}, name, ports);
}

// Puts `pnic` on DVPort `port` of dvs0 (switch id `id`) with `connection`.
auto DVPortUplink(const char* pnic, const char* port, uint32_t connection,
                  const char* id = "dvs-dvs0") {
  return [=](HN::VirtualSwitchInfo&) {
    NetworkFactory::GetDVSwitchByName("dvs0")->AddDVPortUplink(pnic, {id, port, connection});
  };
}

constexpr const char* kUuid = "01 02 03 04 05 06 07 08-09 0a 0b 0c 0d 0e 0f 10";

struct Case {
  const char* operation;
  std::function<void(HN::VirtualSwitchInfo&)> call;
  std::string message;
};

TEST_F(RefusalTest, EveryRefusalSaysWhatAndChangesNothing) {
  SeedSampleHost();
  NetworkInfoImpl network;
  auto info = network.GetVirtualSwitchInfo();
  TarnCtl::Admin::Host admin;
  const std::vector<Case> cases = {
      {"AddVirtualSwitch", [](auto& i) { AddSwitch(i, "dvs0-ps", 64); },
       "Virtual switch dvs0-ps already exists"},
      {"AddVirtualSwitch", [](auto& i) { AddSwitch(i, "op0", 64); },
       "Virtual switch op0 already exists"},
      {"AddVirtualSwitch", [](auto& i) { AddSwitch(i, std::string(32, 'x'), 64); },
       "Virtual switch name " + std::string(32, 'x') + " is too long"},
      {"AddVirtualSwitch", [](auto& i) { AddSwitch(i, "sw", 64, Policy({"pnic4"}, -1)); },
       "Invalid max active uplinks -1"},
      {"AddDVSwitch", [](auto& i) { i.AddDVSwitch("01 02 03", "d1", "cswitch", "d1", 128, 6, 0); },
       "Invalid UUID 01 02 03"},
      {"AddDVSwitch", [](auto& i) { i.AddDVSwitch(kUuid, "d1", "cswitch", "d1", 0, 6, 0); },
       "Invalid number of ports 0"},
      {"AddDVSwitch", [](auto& i) { i.AddDVSwitch(kUuid, "vs1", "cswitch", "vs1", 128, 6, 0); },
       "Virtual switch vs1 already exists"},
      {"RemoveVirtualSwitch", [](auto& i) { i.RemoveVirtualSwitch("vs1"); },
       "Virtual switch vs1 has 2 ports in use"},
      {"RemoveVirtualSwitch", [](auto& i) { i.RemoveVirtualSwitch("dvs0"); },
       "DVS dvs0 has 1 ports in use"},
      {"RemoveVirtualSwitch", [](auto& i) { i.RemoveVirtualSwitch("op0"); },
       "Opaque switch op0 cannot be removed"},
      {"RemoveVirtualSwitch", [](auto& i) { i.RemoveVirtualSwitch("nosuch"); },
       "Virtual switch nosuch does not exist"},
      {"RemovePortGroup", [](auto&) { Switch("vs1")->RemovePortGroup("pg1"); },
       "Portgroup pg1 has 2 ports in use"},
      {"RemovePortGroup", [](auto&) { Switch("vswitch0")->RemovePortGroup("pg2"); },
       "Portgroup pg2 does not exist"},
      {"AddPortGroup", [](auto&) { Switch("vswitch0")->AddPortGroup(std::string(128, 'p')); },
       "Portgroup name " + std::string(128, 'p') + " is too long"},
      {"SetVlanId", [](auto&) { PortGroupImpl("pg2").SetVlanId(4096); },
       "VLAN id 4096 is out of range"},
      {"AddUplink", [](auto&) { Switch("vswitch0")->AddUplink("pnic9", true); },
       "Uplink pnic9 does not exist"},
      {"AddUplink", [](auto&) { Switch("vswitch0")->AddUplink("pnic1", true); },
       "pnic1 is already linked to vs1"},
      {"AddUplink", [](auto&) { Switch("vswitch0")->AddUplink("pnic0", false); },
       "pnic0 is already linked to vswitch0"},
      {"AddUplink", [](auto&) { Switch("vswitch0")->AddUplink("pnic2", true); },
       "pnic2 is already linked to dvs0"},
      {"AddUplink", [](auto&) { Switch("vswitch0")->AddUplink("pnic3", true); },
       "pnic3 is already linked to op0"},
      {"RemoveUplink", [](auto&) { Switch("vs1")->RemoveUplink("pnic0", false); },
       "pnic0 is not linked to vs1"},
      {"SetMTU", [](auto&) { Switch("vs1")->SetMTU(1279); }, "MTU 1279 is out of range"},
      {"SetMTU", [](auto&) { Dvs("dvs0")->SetMTU(100); }, "MTU 100 is out of range"},
      {"SetCdpStatus", [](auto&) { Switch("vs1")->SetCdpStatus(4); }, "Invalid CDP status 4"},
      {"SetTeamingPolicy",
       [](auto&) {
         Switch("vs1")->SetTeamingPolicy(Policy({"a", "b", "a"}, 1));
       },
       "Uplink a appears twice in the teaming order"},
      {"SetTeamingPolicy", [](auto&) { PortGroupImpl("pg1").SetTeamingPolicy(Policy({}, -1)); },
       "Invalid max active uplinks -1"},
      {"GetPortsetById", [](auto&) { NetworkFactory::GetPortsetById("dvs0"); },
       "Portset dvs0 does not exist"},
      {"GetDVSwitchByName", [](auto&) { Dvs("vs1"); }, "DVS vs1 does not exist"},
      {"GetDVSwitchByName", [](auto&) { Dvs("op0"); }, "DVS op0 does not exist"},
      {"PortGroupImpl", [](auto&) { PortGroupImpl("PG1"); }, "Portgroup PG1 does not exist"},
      {"GetUplinkTimeoutConfig", [](auto& i) { i.GetUplinkTimeoutConfig("vs9", 0, ""); },
       "Portset vs9 does not exist"},
      {"LoadLagTimeoutConfig", [](auto& i) { i.LoadLagTimeoutConfig("dvs0", 0); },
       "Portset dvs0 does not exist"},
      {"RestoreDVSwitches", [](auto& i) { i.RestoreDVSwitches("/tmp/other-cache"); },
       "Cannot open distributed switch cache /tmp/other-cache"},
      {"AddDVPortUplink", DVPortUplink("pnic4", "100", 4), "Stale connection id 4 for DVPort 100"},
      {"AddDVPortUplink", DVPortUplink("pnic4", "101", 0), "Stale connection id 0 for DVPort 101"},
      {"AddDVPortUplink", DVPortUplink("pnic4", "102", 5), "DVPort 102 does not exist"},
      {"AddDVPortUplink", DVPortUplink("pnic4", "100", 5, "dvs-other"),
       "DVPort 100 does not belong to DVS dvs0"},
      {"AddDVPortUplink", DVPortUplink("pnic1", "100", 5), "pnic1 is already linked to vs1"},
      {"AddDVPortUplink", DVPortUplink("pnic9", "100", 5), "Uplink pnic9 does not exist"},
      {"RemoveDVPortUplink", [](auto&) { Dvs("dvs0")->RemoveDVPortUplink("pnic1", 0); },
       "pnic1 is not an uplink of DVS dvs0"},
      {"SetConnectionId",
       [](auto&) {
         DVPortImpl({"dvs-dvs0", "999", 0}).SetConnectionId(1);
       },
       "DVPort 999 does not exist"},
      {"SetMTU", [](auto& i) { i.GetOpaqueSwitches().at(0)->SetMTU(1500); },
       "Opaque switch op0 cannot be changed"},
      {"ActivateEns",
       [](auto&) { NetworkFactory::GetPortsetById("vs1")->ActivateEns(false, false); },
       "ENS is not enabled on this host"},
      {"DeactivateEns", [](auto&) { NetworkFactory::GetPortsetById("dvs0-ps")->DeactivateEns(); },
       "ENS is not active on dvs0-ps"},
      {"ReassociateEnsUplinks",
       [](auto&) {
         NetworkFactory::GetPortsetById("op0-ps")->ReassociateEnsUplinks(true, false, 0, 0);
       },
       "Opaque switch op0 cannot be changed"},
  };
  const std::string before = TarnCtl::Admin::DumpHost(admin.db());
  for (const Case& c : cases) {
    const auto [message, detail] = Refused([&] { c.call(*info); });
    EXPECT_EQ(message.substr(0, c.message.size()), c.message) << c.operation;
    EXPECT_EQ(detail.rfind(std::string(c.operation) + ": " + c.message, 0), 0u) << detail;
    EXPECT_EQ(message.find(path_), std::string::npos);
  }
  EXPECT_EQ(TarnCtl::Admin::DumpHost(admin.db()), before);
}

// A refusal follows the state: what was taken becomes free and back.
TEST_F(RefusalTest, ARefusalFollowsTheStateItDependsOn) {
  NetworkInfoImpl network;
  auto info = network.GetVirtualSwitchInfo();
  auto vs1 = AddSwitch(*info, "vs1", 128);
  vs1->AddUplink("pnic1", true);
  EXPECT_EQ(Refusal([&] { vs1->AddUplink("pnic1", true); }), "pnic1 is already linked to vs1");
  vs1->RemoveUplink("pnic1", false);
  EXPECT_EQ(Refusal([&] { vs1->RemoveUplink("pnic1", false); }), "pnic1 is not linked to vs1");
  EXPECT_EQ(Refusal([&] { vs1->RemoveUplink("pnic1", true); }), "pnic1 is not linked to vs1");
  vs1->AddPortGroup("pg1");
  vs1->RemovePortGroup("pg1");
  EXPECT_EQ(Refusal([&] { vs1->AddPortGroup("pg1"); }), "");
  info->RemoveVirtualSwitch("vs1");
  EXPECT_EQ(Refusal([&] { vs1->GetMTU(); }), "Virtual switch vs1 does not exist");
  EXPECT_EQ(Refusal([&] { AddSwitch(*info, "vs1", 8); }), "");
  EXPECT_EQ(Refusal([&] { AddSwitch(*info, std::string(31, 'n'), 4096); }), "");
}

}  // namespace
