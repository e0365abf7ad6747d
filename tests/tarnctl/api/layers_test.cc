// Changes reach both layers unless an operation says otherwise, a reboot
// drops the running state and the restores bring it back (all of it,
// through the tool: the restore transcript).
#include "host_fixture.h"

namespace {

using LayersTest = HostTest;

void RestoreAll() {
  NetworkInfoImpl network;
  auto info = network.GetVirtualSwitchInfo();
  info->RestoreDVSwitches(NetworkInfoImpl::DefaultDVSCacheFile);
  info->Refresh();
  info->RestoreVirtualSwitches();
  for (const auto& sw : info->GetVirtualSwitches(false)) sw->RestoreUplinks();
}

TEST_F(LayersTest, UplinkChangesReachTheLayersTheyName) {
  {
    NetworkInfoImpl network;
    auto vs0 = Switch("vswitch0");
    vs0->AddUplink("pnic1", false);  // running only
    vs0->AddUplink("pnic2", true);   // both
    vs0->AddUplink("pnic3", true);
    vs0->RemoveUplink("pnic3", true);  // stored only: still running
    EXPECT_EQ(vs0->GetUplinks(), (std::vector<std::string>{"pnic0", "pnic1", "pnic2", "pnic3"}));
    EXPECT_EQ(vs0->GetUsedPorts(), 4u);
  }
  Reboot();
  RestoreAll();
  EXPECT_EQ(Switch("vswitch0")->GetUplinks(), (std::vector<std::string>{"pnic0", "pnic2"}));
  // Removal from both layers stays removed after a reboot.
  Switch("vswitch0")->RemoveUplink("pnic2", false);
  Reboot();
  RestoreAll();
  EXPECT_EQ(Switch("vswitch0")->GetUplinks(), (std::vector<std::string>{"pnic0"}));
}

TEST_F(LayersTest, RestoreUplinksRefusesAPnicTakenByAnotherSwitch) {
  SeedSampleHost();
  Reboot();
  NetworkInfoImpl network;
  auto info = network.GetVirtualSwitchInfo();
  info->RestoreVirtualSwitches();
  Switch("vswitch0")->AddUplink("pnic1", false);
  EXPECT_EQ(Refusal([] { Switch("vs1")->RestoreUplinks(); }),
            "pnic1 is already linked to vswitch0");
  EXPECT_EQ(Switch("vs1")->GetUplinks(), std::vector<std::string>{});
  // A restored link takes its stored place in the order.
  Switch("vswitch0")->RestoreUplinks();
  EXPECT_EQ(Switch("vswitch0")->GetUplinks(), (std::vector<std::string>{"pnic0", "pnic1"}));
}

TEST_F(LayersTest, RemovingASwitchRemovesItEverywhere) {
  SeedSampleHost();
  {
    NetworkInfoImpl network;
    auto info = network.GetVirtualSwitchInfo();
    Switch("vs1")->RemovePortGroup("pg2");
    info->RemoveVirtualSwitch("vswitch0");
    auto names = network.GetAllPortGroupNames(HN::PORTSET_GET_DEFAULT);
    EXPECT_EQ(names, (std::set<std::string>{"pg1"}));
    // The pnic of the removed switch is free again.
    Switch("vs1")->AddUplink("pnic0", true);
  }
  Reboot();
  RestoreAll();
  NetworkInfoImpl network;
  EXPECT_FALSE(network.GetVirtualSwitchInfo()->SwitchExists("vswitch0"));
  EXPECT_EQ(network.GetAllPortGroupNames(HN::PORTSET_GET_DEFAULT), (std::set<std::string>{"pg1"}));
  EXPECT_EQ(Switch("vs1")->GetUplinks(), (std::vector<std::string>{"pnic1", "pnic0"}));
}

// Distributed switches come back from the cache; removing one removes it
// from the cache too.
TEST_F(LayersTest, DistributedSwitchesLiveInTheCache) {
  SeedSampleHost();
  Reboot();
  NetworkInfoImpl network;
  auto info = network.GetVirtualSwitchInfo();
  EXPECT_TRUE(info->GetDVSwitches().empty());
  EXPECT_EQ(info->GetOpaqueSwitches().size(), 1u);  // kept across reboots
  info->RestoreDVSwitches(NetworkInfoImpl::DefaultDVSCacheFile);
  auto dvs = NetworkFactory::GetDVSwitchByName("dvs0");
  EXPECT_EQ(dvs->GetUplinks(), std::vector<std::string>{"pnic2"});
  EXPECT_EQ(dvs->GetUsedPorts(), 2u);  // one uplink, one DVPort with a client

  info->AddDVSwitch("00 00 00 00 00 00 00 00-00 00 00 00 00 00 00 09", "dvs9", "cswitch", "dvs9",
                    64, 6, 0);
  info->RemoveVirtualSwitch("dvs9");
  Reboot();
  info->RestoreDVSwitches(NetworkInfoImpl::DefaultDVSCacheFile);
  EXPECT_EQ(info->GetDVSwitches().size(), 1u);
  EXPECT_EQ(Refusal([] { NetworkFactory::GetDVSwitchByName("dvs9"); }), "DVS dvs9 does not exist");
}

}  // namespace
