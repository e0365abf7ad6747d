// Standard switches: port groups, teaming policy, CDP status and MTU.
// Every change is one transaction and goes to both layers.
#include <array>

#include "hostctl/tarnctl.h"
#include "tarnctl/call.h"
#include "tarnctl/checks.h"
#include "tarnctl/errors.h"
#include "tarnctl/limits.h"
#include "tarnctl/policy_codec.h"
#include "tarnctl/portgroup_state.h"
#include "tarnctl/standard_state.h"
#include "tarnctl/teaming.h"

namespace TarnCtl::Network {

using Detail::Call;
using Detail::FormatArgs;
using Detail::Refused;
using Detail::Session;
using Detail::StandardState;
using Detail::Transaction;
using HostCtl::Network::NicTeamingPolicy;

namespace {

// Runs `sql` (value ?1, switch name ?2) in a transaction of its own; the
// statement names the switch in both layers.
template <typename Value>
void Update(StandardState& sw, const char* sql, const Value& value) {
  Transaction transaction(*sw.session);
  sw.session->Prepare(sql).Bind(1, value).Bind(2, sw.name()).Run();
  transaction.Commit();
}

}  // namespace

VirtualSwitchImpl::VirtualSwitchImpl(std::unique_ptr<PortsetImpl::State> state)
    : PortsetImpl(std::move(state)) {}

VirtualSwitchImpl::~VirtualSwitchImpl() = default;

int32_t VirtualSwitchImpl::ParseCdpStatus(const std::string& word) {
  static const std::array<std::string, 4> kWords = {"down", "listen", "advertise", "both"};
  const auto session = Session::Current();
  Call call(session.get(), "ParseCdpStatus", Detail::Named(word), FormatArgs(word));
  for (size_t i = 0; i < kWords.size(); ++i) {
    if (word == kWords[i]) return static_cast<int32_t>(i);
  }
  throw Refused("Unknown CDP status " + word, "(expected down, listen, advertise or both)");
}

std::vector<std::unique_ptr<HostCtl::Network::PortGroup>> VirtualSwitchImpl::GetPortGroups() {
  StandardState& sw = Detail::AsStandard(*state_);
  Call call(sw.session.get(), "GetPortGroups", sw.CallTarget(), "");
  sw.Row();
  std::vector<std::unique_ptr<HostCtl::Network::PortGroup>> groups;
  auto select = sw.session->Prepare(
      "SELECT name, vlan, policy FROM portgroup WHERE layer = 1 AND switch = ? ORDER BY seq");
  select.Bind(1, sw.name());
  while (select.Step()) {
    PortGroupRow row{sw.name(), static_cast<uint16_t>(select.Int(1)), select.Text(2)};
    groups.push_back(std::make_unique<PortGroupImpl>(
        std::make_unique<PortGroupImpl::State>(sw.session, select.Text(0), std::move(row))));
  }
  return groups;
}

std::unique_ptr<HostCtl::Network::PortGroup> VirtualSwitchImpl::AddPortGroup(
    const std::string& name) {
  StandardState& sw = Detail::AsStandard(*state_);
  Call call(sw.session.get(), "AddPortGroup", sw.CallTarget(), FormatArgs(name));
  sw.Row();
  if (name.empty()) throw Refused("Portgroup name is empty");
  if (name.size() > Detail::kMaxPortGroupName) {
    throw Refused("Portgroup name " + name + " is too long",
                  "(at most " + std::to_string(Detail::kMaxPortGroupName) + " bytes)");
  }
  Session& session = *sw.session;
  if (session.Prepare("SELECT 1 FROM portgroup WHERE layer = 1 AND name = ?")
          .Bind(1, name)
          .Step()) {
    throw Refused("Portgroup " + name + " already exists", "on this host");
  }
  const std::string policy = Detail::EncodeTeamingPolicy(Detail::NewPortGroupPolicy());
  Transaction transaction(session);
  const int64_t seq = session.NextSeq();
  for (int64_t layer : {0, 1}) {
    session
        .Prepare(
            "INSERT OR REPLACE INTO portgroup(layer, name, switch, seq, vlan, policy)"
            " VALUES (?, ?, ?, ?, 0, ?)")
        .Bind(1, layer)
        .Bind(2, name)
        .Bind(3, sw.name())
        .Bind(4, seq)
        .Bind(5, policy)
        .Run();
  }
  transaction.Commit();
  return std::make_unique<PortGroupImpl>(
      std::make_unique<PortGroupImpl::State>(sw.session, name, PortGroupRow{sw.name(), 0, policy}));
}

void VirtualSwitchImpl::RemovePortGroup(const std::string& name) {
  StandardState& sw = Detail::AsStandard(*state_);
  Call call(sw.session.get(), "RemovePortGroup", sw.CallTarget(), FormatArgs(name));
  sw.Row();
  Session& session = *sw.session;
  if (!session.Prepare("SELECT 1 FROM portgroup WHERE layer = 1 AND name = ? AND switch = ?")
           .Bind(1, name)
           .Bind(2, sw.name())
           .Step()) {
    throw Refused("Portgroup " + name + " does not exist", "on vswitch " + sw.name());
  }
  auto clients = session.Prepare("SELECT count(*) FROM client WHERE portgroup = ?");
  clients.Bind(1, name).Step();
  if (const int64_t used = clients.Int(0); used > 0) {
    throw Refused("Portgroup " + name + " has " + std::to_string(used) + " ports in use");
  }
  Transaction transaction(session);
  session.Prepare("DELETE FROM portgroup WHERE name = ? AND switch = ?")
      .Bind(1, name)
      .Bind(2, sw.name())
      .Run();
  transaction.Commit();
}

NicTeamingPolicy VirtualSwitchImpl::GetTeamingPolicy() {
  StandardState& sw = Detail::AsStandard(*state_);
  Call call(sw.session.get(), "GetTeamingPolicy", sw.CallTarget(), "");
  return Detail::DecodeTeamingPolicy(sw.Row().policy);
}

void VirtualSwitchImpl::SetTeamingPolicy(NicTeamingPolicy policy) {
  StandardState& sw = Detail::AsStandard(*state_);
  Call call(sw.session.get(), "SetTeamingPolicy", sw.CallTarget(), FormatArgs(policy));
  sw.Row();
  Detail::CheckTeamingPolicy(policy);
  Update(sw, "UPDATE vswitch SET policy = ?1 WHERE name = ?2", Detail::EncodeTeamingPolicy(policy));
}

int32_t VirtualSwitchImpl::GetCdpStatus() {
  StandardState& sw = Detail::AsStandard(*state_);
  Call call(sw.session.get(), "GetCdpStatus", sw.CallTarget(), "");
  return sw.Row().cdp;
}

void VirtualSwitchImpl::SetCdpStatus(int32_t status) {
  StandardState& sw = Detail::AsStandard(*state_);
  Call call(sw.session.get(), "SetCdpStatus", sw.CallTarget(), FormatArgs(status));
  sw.Row();
  if (status < 0 || status > Detail::kMaxCdpStatus) {
    throw Refused("Invalid CDP status " + std::to_string(status),
                  "(0-" + std::to_string(Detail::kMaxCdpStatus) + ")");
  }
  Update(sw, "UPDATE vswitch SET cdp = ?1 WHERE name = ?2", int64_t{status});
}

uint32_t VirtualSwitchImpl::GetMTU() {
  StandardState& sw = Detail::AsStandard(*state_);
  Call call(sw.session.get(), "GetMTU", sw.CallTarget(), "");
  return sw.Row().mtu;
}

void VirtualSwitchImpl::SetMTU(uint16_t mtu) {
  StandardState& sw = Detail::AsStandard(*state_);
  Call call(sw.session.get(), "SetMTU", sw.CallTarget(), FormatArgs(mtu));
  sw.Row();
  Detail::CheckMtu(mtu);
  Update(sw, "UPDATE vswitch SET mtu = ?1 WHERE name = ?2", int64_t{mtu});
}

}  // namespace TarnCtl::Network
