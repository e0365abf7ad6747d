// Standard switches: port groups, teaming policy, CDP status and MTU.
// Every change goes to both layers.
#include "hostctl/tarnctl.h"
#include "tarnctl/api/portgroup_state.h"
#include "tarnctl/api/standard_state.h"
#include "tarnctl/instrument/errors.h"
#include "tarnctl/model/limits.h"
#include "tarnctl/model/names.h"
#include "tarnctl/model/teaming.h"
#include "tarnctl/model/words.h"
#include "tarnctl/store/meta.h"
#include "tarnctl/store/policy_codec.h"

namespace TarnCtl::Network {

using Api::StandardState;
using HostCtl::Network::NicTeamingPolicy;
using Instrument::Refused;
using Store::Layer;

VirtualSwitchImpl::VirtualSwitchImpl(std::unique_ptr<PortsetImpl::State> state)
    : PortsetImpl(std::move(state)) {}

VirtualSwitchImpl::~VirtualSwitchImpl() = default;

int32_t VirtualSwitchImpl::ParseCdpStatus(const std::string& word) {
  const auto session = Api::Session::Current();
  TARN_CALL(session ? &session->db() : nullptr, ParseCdpStatus, Instrument::Named(word), word);
  return Model::CdpStatusOfWord(word);
}

std::vector<std::unique_ptr<HostCtl::Network::PortGroup>> VirtualSwitchImpl::GetPortGroups() {
  StandardState& sw = Api::AsStandard(*state_);
  TARN_CALL_ON(sw, GetPortGroups);
  sw.EnsureStillExists();
  std::vector<std::unique_ptr<HostCtl::Network::PortGroup>> groups;
  for (auto& group : Store::PortGroups::OnSwitch(sw.db(), Layer::kRunning, sw.name())) {
    groups.push_back(std::make_unique<PortGroupImpl>(std::make_unique<PortGroupImpl::State>(
        sw.session, std::move(group.name), std::move(group.row))));
  }
  return groups;
}

std::unique_ptr<HostCtl::Network::PortGroup> VirtualSwitchImpl::AddPortGroup(
    const std::string& name) {
  StandardState& sw = Api::AsStandard(*state_);
  TARN_CALL_ON(sw, AddPortGroup, name);
  sw.EnsureStillExists();
  Model::CheckName(Model::NameKind::kPortGroup, name);
  Store::Db& db = sw.db();
  if (Store::PortGroups::Exists(db, Layer::kRunning, name)) {
    throw Refused("Portgroup " + name + " already exists", "on this host");
  }
  const Store::PortGroups::Row row{sw.name(), 0,
                                   Store::EncodeTeamingPolicy(Model::NewPortGroupPolicy())};
  const int64_t seq = Store::Meta::NextSeq(db);
  for (Layer layer : Store::kBothLayers) Store::PortGroups::Insert(db, layer, name, seq, row);
  // Read back when asked: clients waiting for a port group of this name
  // are on it now.
  return std::make_unique<PortGroupImpl>(std::make_unique<PortGroupImpl::State>(sw.session, name));
}

void VirtualSwitchImpl::RemovePortGroup(const std::string& name) {
  StandardState& sw = Api::AsStandard(*state_);
  TARN_CALL_ON(sw, RemovePortGroup, name);
  sw.EnsureStillExists();
  Store::Db& db = sw.db();
  const auto group = Store::PortGroups::Find(db, Layer::kRunning, name);
  if (!group || group->switchName != sw.name()) {
    throw Refused("Portgroup " + name + " does not exist", "on vswitch " + sw.name());
  }
  if (const int64_t used = Store::PortGroups::ClientCount(db, name); used > 0) {
    throw Refused("Portgroup " + name + " has " + std::to_string(used) + " ports in use");
  }
  Store::PortGroups::Delete(db, name, sw.name());
}

NicTeamingPolicy VirtualSwitchImpl::GetTeamingPolicy() {
  StandardState& sw = Api::AsStandard(*state_);
  TARN_CALL_ON(sw, GetTeamingPolicy);
  return Store::DecodeTeamingPolicy(sw.Row().policy);
}

void VirtualSwitchImpl::SetTeamingPolicy(NicTeamingPolicy policy) {
  StandardState& sw = Api::AsStandard(*state_);
  TARN_CALL_ON(sw, SetTeamingPolicy, policy);
  sw.EnsureStillExists();
  Model::CheckTeamingPolicy(policy);
  Store::Standard::SetPolicy(sw.db(), sw.name(), Store::EncodeTeamingPolicy(policy));
}

int32_t VirtualSwitchImpl::GetCdpStatus() {
  StandardState& sw = Api::AsStandard(*state_);
  TARN_CALL_ON(sw, GetCdpStatus);
  return sw.Row().cdp;
}

void VirtualSwitchImpl::SetCdpStatus(int32_t status) {
  StandardState& sw = Api::AsStandard(*state_);
  TARN_CALL_ON(sw, SetCdpStatus, status);
  sw.EnsureStillExists();
  Model::Check(Model::kCdpStatus, status);
  Store::Standard::SetCdp(sw.db(), sw.name(), status);
}

uint32_t VirtualSwitchImpl::GetMTU() {
  StandardState& sw = Api::AsStandard(*state_);
  TARN_CALL_ON(sw, GetMTU);
  return sw.Row().mtu;
}

void VirtualSwitchImpl::SetMTU(uint16_t mtu) {
  StandardState& sw = Api::AsStandard(*state_);
  TARN_CALL_ON(sw, SetMTU, mtu);
  sw.EnsureStillExists();
  Model::Check(Model::kMtu, mtu);
  Store::Standard::SetMtu(sw.db(), sw.name(), mtu);
}

}  // namespace TarnCtl::Network
