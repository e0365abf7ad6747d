// Distributed and opaque switches, DVPorts, ENS and timeouts through the
// interface: what the tool relies on beyond the refusals.
#include "host_fixture.h"
#include "hostctl/nodi.h"

namespace {

namespace HN = HostCtl::Network;
using HN::NetworkFactory;
using TarnCtl::Network::DVPortImpl;
using TarnCtl::Network::NetworkInfoImpl;

using DvsTest = HostTest;

TEST_F(DvsTest, AnUplinkGoesOnADVPortWithItsConnectionId) {
  SeedSampleHost();
  NetworkInfoImpl network;
  auto dvs = NetworkFactory::GetDVSwitchByName("dvs0");
  EXPECT_EQ(dvs->GetName(), "dvs0-ps");
  EXPECT_EQ(dvs->GetSwitchName(), "dvs0");
  EXPECT_EQ(dvs->GetDVSwitchId(), "dvs-dvs0");

  // An unknown key makes a port object all the same.
  EXPECT_FALSE(DVPortImpl({"dvs-other", "101", 0}).IsValid());
  EXPECT_FALSE(DVPortImpl({"dvs-dvs0", "102", 0}).IsValid());

  DVPortImpl port({"dvs-dvs0", "101", 0});
  ASSERT_TRUE(port.IsValid());
  EXPECT_EQ(port.GetConnectionId(), 0u);
  port.SetConnectionId(1700000000);
  EXPECT_EQ(DVPortImpl({"dvs-dvs0", "101", 0}).GetConnectionId(), 1700000000u);
  dvs->AddDVPortUplink("pnic4", {"dvs-dvs0", "101", 1700000000});
  EXPECT_EQ(dvs->GetUplinks(), (std::vector<std::string>{"pnic2", "pnic4"}));
  EXPECT_EQ(dvs->GetUsedPorts(), 3u);
  EXPECT_EQ(Refusal([] {
              NetworkFactory::GetVirtualSwitchById("vswitch0", HN::PORTSET_GET_DEFAULT)
                  ->AddUplink("pnic4", true);
            }),
            "pnic4 is already linked to dvs0");
  dvs->RemoveDVPortUplink("pnic2", 0);
  EXPECT_EQ(dvs->GetUplinks(), std::vector<std::string>{"pnic4"});
  EXPECT_EQ(port.TestDVPortNota(), 0);

  const auto params = dvs->GetDVPortParams();
  ASSERT_EQ(params.size(), 2u);
  EXPECT_EQ(params.at("100").connectionId, 5u);
  EXPECT_EQ(params.at("101").connectionId, 1700000000u);
  EXPECT_EQ(params.at("101").switchId, "dvs-dvs0");

  auto ports = dvs->GetDVPorts();
  ASSERT_EQ(ports.size(), 2u);
  std::vector<std::string> clients;
  EXPECT_TRUE(ports[0]->IsInUse(clients));
  EXPECT_EQ(clients, std::vector<std::string>{"vm-c"});
  EXPECT_FALSE(ports[1]->IsInUse(clients));
  EXPECT_TRUE(clients.empty());
  EXPECT_EQ(ports[1]->GetParam().portId, "101");
}

TEST_F(DvsTest, OpaqueSwitchesAnswerReadsOnly) {
  SeedSampleHost();
  NetworkInfoImpl network;
  auto opaque = network.GetVirtualSwitchInfo()->GetOpaqueSwitches();
  ASSERT_EQ(opaque.size(), 1u);
  HN::DVSwitch& op = *opaque[0];
  EXPECT_EQ(op.GetSwitchName(), "op0");
  EXPECT_EQ(op.GetName(), "op0-ps");
  EXPECT_EQ(op.GetMTU(), 1500u);
  EXPECT_EQ(op.GetNumPorts(), op.GetConfiguredPorts());
  EXPECT_EQ(op.GetUplinks(), std::vector<std::string>{"pnic3"});
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

  TarnCtl::Admin::Host().Reboot();  // ENS state and the node go with it
  network.GetVirtualSwitchInfo()->RestoreDVSwitches(NetworkInfoImpl::DefaultDVSCacheFile);
  EXPECT_FALSE(NetworkFactory::GetPortsetById("dvs0-ps")->GetEnsMode());
  EXPECT_EQ(Refusal([] { NetworkFactory::GetPortsetById("dvs0-ps")->ActivateEns(false, false); }),
            "ENS is not enabled on this host");
}

TEST_F(DvsTest, TimeoutsLoadAndListByFilter) {
  SeedSampleHost();
  {
    TarnCtl::Admin::Host admin;
    admin.AddUplinkTimeout("vs1", "pnic2", 1, 1);
    admin.AddUplinkTimeout("vs1", "pnic1", 16, 65);
    admin.AddUplinkTimeout("vs1", "pnic1", 1, 0);
    admin.AddUplinkTimeout("dvs0-ps", "pnic1", 1, 255);
    admin.AddLagTimeout("vs1", 7, 1);
    admin.AddLagTimeout("dvs0-ps", 7, 3);
    admin.AddLagTimeout("vs1", 2, 9);
  }
  NetworkInfoImpl network;
  auto info = network.GetVirtualSwitchInfo();
  auto uplinks = [&](const std::string& portset, uint32_t lag, const std::string& uplink) {
    std::string text;
    for (const auto& r : info->GetUplinkTimeoutConfig(portset, lag, uplink)) {
      text += r.portsetName + "," + r.uplinkName + "," + std::to_string(r.lagId) + "," +
              std::to_string(r.timeout) + ";";
    }
    return text;
  };
  auto lags = [&](const std::string& portset, uint32_t lag) {
    std::string text;
    for (const auto& r : info->GetLagTimeoutConfig(portset, lag)) {
      text += r.portsetName + "," + std::to_string(r.lagId) + "," + std::to_string(r.timeout) + ";";
    }
    return text;
  };
  EXPECT_EQ(uplinks("", 0, ""), "");  // stored, not loaded yet
  info->LoadUplinkTimeoutConfig("vs1", 0, "pnic1");
  EXPECT_EQ(uplinks("", 0, ""), "vs1,pnic1,1,0;vs1,pnic1,16,65;");
  info->LoadUplinkTimeoutConfig("", 1, "");
  EXPECT_EQ(uplinks("", 0, ""), "dvs0-ps,pnic1,1,255;vs1,pnic1,1,0;vs1,pnic1,16,65;vs1,pnic2,1,1;");
  EXPECT_EQ(uplinks("vs1", 1, ""), "vs1,pnic1,1,0;vs1,pnic2,1,1;");
  EXPECT_EQ(uplinks("", 0, "pnic2"), "vs1,pnic2,1,1;");
  info->LoadLagTimeoutConfig("", 7);
  EXPECT_EQ(lags("", 0), "dvs0-ps,7,3;vs1,7,1;");
  info->LoadLagTimeoutConfig("", 0);
  EXPECT_EQ(lags("vs1", 0), "vs1,2,9;vs1,7,1;");
  TarnCtl::Admin::Host().Reboot();
  EXPECT_EQ(lags("", 0), "");
}

}  // namespace
