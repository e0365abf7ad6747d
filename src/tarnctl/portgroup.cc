// Port groups of standard switches. Changes go to both layers.
#include "hostctl/tarnctl.h"
#include "tarnctl/call.h"
#include "tarnctl/errors.h"
#include "tarnctl/limits.h"
#include "tarnctl/policy_codec.h"
#include "tarnctl/portgroup_state.h"
#include "tarnctl/teaming.h"

namespace TarnCtl::Network {

using Detail::Call;
using Detail::FormatArgs;
using Detail::On;
using Detail::Session;
using Detail::Transaction;
using HostCtl::Network::NicTeamingPolicy;

namespace {

// A port of a port group: one client attached to it.
class ClientPort : public HostCtl::Network::Port {};

}  // namespace

const PortGroupRow& PortGroupImpl::State::Row() {
  return row.Get(*session, [this] {
    auto select =
        session->Prepare("SELECT switch, vlan, policy FROM portgroup WHERE layer = 1 AND name = ?");
    if (!select.Bind(1, name).Step()) {
      throw Detail::Refused("Portgroup " + name + " does not exist", "on this host");
    }
    return PortGroupRow{select.Text(0), static_cast<uint16_t>(select.Int(1)), select.Text(2)};
  });
}

bool PortGroupImpl::IsValidPortGroup(const std::string& name) {
  const auto session = Session::Acquire();
  Call call(session.get(), "IsValidPortGroup", Detail::Named(name), FormatArgs(name));
  return session->Prepare("SELECT 1 FROM portgroup WHERE layer = 1 AND name = ?")
      .Bind(1, name)
      .Step();
}

PortGroupImpl::PortGroupImpl(const std::string& name)
    : state_(std::make_unique<State>(Session::Acquire(), name)) {
  Call call(state_->session.get(), "PortGroupImpl", Detail::Named(name), FormatArgs(name));
  state_->Row();
}

PortGroupImpl::PortGroupImpl(std::unique_ptr<State> state) : state_(std::move(state)) {}

PortGroupImpl::~PortGroupImpl() = default;

std::string PortGroupImpl::GetName() {
  Call call(state_->session.get(), "GetName", On(state_->name), "");
  return state_->name;
}

std::vector<std::unique_ptr<HostCtl::Network::Port>> PortGroupImpl::GetPorts() {
  Call call(state_->session.get(), "GetPorts", On(state_->name), "");
  state_->Row();
  auto count = state_->session->Prepare("SELECT count(*) FROM client WHERE portgroup = ?");
  count.Bind(1, state_->name).Step();
  std::vector<std::unique_ptr<HostCtl::Network::Port>> ports;
  for (int64_t i = 0; i < count.Int(0); ++i) ports.push_back(std::make_unique<ClientPort>());
  return ports;
}

uint16_t PortGroupImpl::GetVlanId() {
  Call call(state_->session.get(), "GetVlanId", On(state_->name), "");
  return state_->Row().vlan;
}

void PortGroupImpl::SetVlanId(uint16_t vlanId) {
  Call call(state_->session.get(), "SetVlanId", On(state_->name), FormatArgs(vlanId));
  state_->Row();
  if (vlanId > Detail::kMaxVlanId) {
    throw Detail::Refused("VLAN id " + std::to_string(vlanId) + " is out of range",
                          "(0-" + std::to_string(Detail::kMaxVlanId) + ")");
  }
  Session& session = *state_->session;
  Transaction transaction(session);
  session.Prepare("UPDATE portgroup SET vlan = ? WHERE name = ?")
      .Bind(1, vlanId)
      .Bind(2, state_->name)
      .Run();
  transaction.Commit();
}

NicTeamingPolicy PortGroupImpl::GetTeamingPolicy() {
  Call call(state_->session.get(), "GetTeamingPolicy", On(state_->name), "");
  return Detail::DecodeTeamingPolicy(state_->Row().policy);
}

void PortGroupImpl::SetTeamingPolicy(NicTeamingPolicy policy) {
  Call call(state_->session.get(), "SetTeamingPolicy", On(state_->name), FormatArgs(policy));
  state_->Row();
  Detail::CheckTeamingPolicy(policy);
  Session& session = *state_->session;
  Transaction transaction(session);
  session.Prepare("UPDATE portgroup SET policy = ? WHERE name = ?")
      .Bind(1, Detail::EncodeTeamingPolicy(policy))
      .Bind(2, state_->name)
      .Run();
  transaction.Commit();
}

}  // namespace TarnCtl::Network
