// Distributed and opaque switches, DVPorts, ENS and timeouts through the
// interface: what the tool relies on beyond the refusals.
#include "host_fixture.h"

namespace {

using DvsTest = HostTest;

TEST_F(DvsTest, AnUplinkGoesOnADVPortWithItsConnectionId) {
  SeedSampleHost();
  NetworkInfoImpl network;
  auto dvs = Dvs("dvs0");
  EXPECT_EQ(dvs->GetName(), "dvs0-ps");
  EXPECT_EQ(dvs->GetDVSwitchId(), "dvs-dvs0");
  // An unknown key makes a port object all the same.
  EXPECT_FALSE(DVPortImpl({"dvs-other", "101", 0}).IsValid());
  EXPECT_FALSE(DVPortImpl({"dvs-dvs0", "102", 0}).IsValid());

  DVPortImpl port({"dvs-dvs0", "101", 0});
  ASSERT_TRUE(port.IsValid());
  EXPECT_EQ(port.GetConnectionId(), 0u);
  port.SetConnectionId(1700000000);
  EXPECT_EQ(dvs->GetDVPortParams().at("101").connectionId, 1700000000u);
  dvs->AddDVPortUplink("pnic4", {"dvs-dvs0", "101", 1700000000});
  EXPECT_EQ(dvs->GetUplinks(), (std::vector<std::string>{"pnic2", "pnic4"}));
  dvs->RemoveDVPortUplink("pnic2", 0);
  EXPECT_EQ(dvs->GetUplinks(), std::vector<std::string>{"pnic4"});
}

TEST_F(DvsTest, OpaqueSwitchesAnswerReadsOnly) {
  SeedSampleHost();
  NetworkInfoImpl network;
  auto opaque = network.GetVirtualSwitchInfo()->GetOpaqueSwitches();
  ASSERT_EQ(opaque.size(), 1u);
  HN::DVSwitch& op = *opaque[0];
  EXPECT_EQ(op.GetName(), "op0-ps");
  EXPECT_EQ(op.GetDVSwitchId(), "");
  EXPECT_TRUE(op.GetDVPorts().empty());
  EXPECT_FALSE(op.GetEnsMode());
  EXPECT_EQ(Refusal([&] { op.RemoveDVPortUplink("pnic3", 0); }),
            "Opaque switch op0 cannot be changed");
}

TEST_F(DvsTest, EnsFollowsTheNodeAndThePortset) {
  SeedSampleHost();
  NODI_ParamList* list = TarnCtl::Util::SysinfoUtil::GetIntParamList(1, NODI_PARAM_LIST_INT);
  ASSERT_EQ(NODI_Set(NODI_NODE_net_ens_activate, 0, list, 0, 0), TARN_OK);
  NODI_ParamListDestroy(list);
  NetworkInfoImpl network;
  // A distributed switch's portset is found by its portset name.
  auto portset = NetworkFactory::GetPortsetById("dvs0-ps");
  EXPECT_FALSE(portset->GetEnsMode());
  portset->ActivateEns(true, true);
  EXPECT_TRUE(portset->GetEnsMode());
  EXPECT_FALSE(NetworkFactory::GetPortsetById("vs1")->GetEnsMode());
  portset->ReassociateEnsUplinks(true, false, 0, 0);
  portset->DeactivateEns();
  EXPECT_FALSE(portset->GetEnsMode());
  portset->ActivateEns(false, false);

  Reboot();  // ENS state and the node go with it
  network.GetVirtualSwitchInfo()->RestoreDVSwitches(NetworkInfoImpl::DefaultDVSCacheFile);
  EXPECT_FALSE(NetworkFactory::GetPortsetById("dvs0-ps")->GetEnsMode());
  EXPECT_EQ(Refusal([] { NetworkFactory::GetPortsetById("dvs0-ps")->ActivateEns(false, false); }),
            "ENS is not enabled on this host");
}

// What the timeouts transcript cannot reach: the lag filter of the listing,
// and a reboot dropping what was loaded.
TEST_F(DvsTest, LoadedTimeoutsFilterByLagAndGoWithAReboot) {
  SeedSampleHost();
  {
    TarnCtl::Admin::Host admin;
    TarnCtl::Admin::AddUplinkTimeout(admin.db(), "vs1", "pnic2", 1, 1);
    TarnCtl::Admin::AddUplinkTimeout(admin.db(), "vs1", "pnic1", 16, 65);
    TarnCtl::Admin::AddLagTimeout(admin.db(), "vs1", 7, 1);
  }
  NetworkInfoImpl network;
  auto info = network.GetVirtualSwitchInfo();
  info->LoadUplinkTimeoutConfig("", 0, "");
  info->LoadLagTimeoutConfig("", 0);
  const auto uplinks = info->GetUplinkTimeoutConfig("vs1", 16, "");
  ASSERT_EQ(uplinks.size(), 1u);
  EXPECT_EQ(uplinks[0].uplinkName, "pnic1");
  EXPECT_EQ(uplinks[0].timeout, 65u);
  EXPECT_EQ(info->GetLagTimeoutConfig("", 0).size(), 1u);
  EXPECT_TRUE(info->GetLagTimeoutConfig("", 8).empty());
  Reboot();
  EXPECT_TRUE(info->GetUplinkTimeoutConfig("", 0, "").empty());
  EXPECT_TRUE(info->GetLagTimeoutConfig("", 0).empty());
}

}  // namespace
