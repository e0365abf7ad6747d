// Port groups of standard switches. Changes go to both layers.
#include "hostctl/tarnctl.h"
#include "tarnctl/api/portgroup_state.h"
#include "tarnctl/instrument/call.h"
#include "tarnctl/instrument/errors.h"
#include "tarnctl/model/limits.h"
#include "tarnctl/model/teaming.h"
#include "tarnctl/store/policy_codec.h"

namespace TarnCtl::Network {

using HostCtl::Network::NicTeamingPolicy;
using Store::Layer;

namespace {

// A port of a port group: one client attached to it.
class ClientPort : public HostCtl::Network::Port {};

}  // namespace

const Store::PortGroups::Row& PortGroupImpl::State::Row() {
  return row.Get(db(), [this] {
    auto found = Store::PortGroups::Find(db(), Layer::kRunning, name);
    if (!found) throw Instrument::Refused("Portgroup " + name + " does not exist", "on this host");
    return *std::move(found);
  });
}

bool PortGroupImpl::IsValidPortGroup(const std::string& name) {
  const auto session = Api::Session::Acquire();
  TARN_CALL(&session->db(), IsValidPortGroup, Instrument::Named(name), name);
  return Store::PortGroups::Exists(session->db(), Layer::kRunning, name);
}

PortGroupImpl::PortGroupImpl(const std::string& name)
    : state_(std::make_unique<State>(Api::Session::Acquire(), name)) {
  TARN_CALL(&state_->db(), PortGroupImpl, Instrument::Named(name), name);
  state_->EnsureStillExists();
}

PortGroupImpl::PortGroupImpl(std::unique_ptr<State> state) : state_(std::move(state)) {}

PortGroupImpl::~PortGroupImpl() = default;

std::string PortGroupImpl::GetName() {
  TARN_CALL_ON(*state_, GetName);
  return state_->name;
}

std::vector<std::unique_ptr<HostCtl::Network::Port>> PortGroupImpl::GetPorts() {
  TARN_CALL_ON(*state_, GetPorts);
  const int64_t clients = state_->Row().clients;
  std::vector<std::unique_ptr<HostCtl::Network::Port>> ports;
  for (int64_t i = 0; i < clients; ++i) ports.push_back(std::make_unique<ClientPort>());
  return ports;
}

uint16_t PortGroupImpl::GetVlanId() {
  TARN_CALL_ON(*state_, GetVlanId);
  return state_->Row().vlan;
}

void PortGroupImpl::SetVlanId(uint16_t vlanId) {
  TARN_CALL_ON(*state_, SetVlanId, vlanId);
  state_->EnsureStillExists();
  Model::Check(Model::kVlanId, vlanId);
  Store::PortGroups::SetVlan(state_->db(), state_->name, vlanId);
}

NicTeamingPolicy PortGroupImpl::GetTeamingPolicy() {
  TARN_CALL_ON(*state_, GetTeamingPolicy);
  return Store::DecodeTeamingPolicy(state_->Row().policy);
}

void PortGroupImpl::SetTeamingPolicy(NicTeamingPolicy policy) {
  TARN_CALL_ON(*state_, SetTeamingPolicy, policy);
  state_->EnsureStillExists();
  Model::CheckTeamingPolicy(policy);
  Store::PortGroups::SetPolicy(state_->db(), state_->name, Store::EncodeTeamingPolicy(policy));
}

}  // namespace TarnCtl::Network
