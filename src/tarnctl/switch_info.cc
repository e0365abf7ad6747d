// The switch information object: creation, removal and lists of switches.
#include "hostctl/tarnctl.h"
#include "tarnctl/call.h"
#include "tarnctl/checks.h"
#include "tarnctl/dvswitch.h"
#include "tarnctl/errors.h"
#include "tarnctl/info_state.h"
#include "tarnctl/limits.h"
#include "tarnctl/names.h"
#include "tarnctl/policy_codec.h"
#include "tarnctl/switches.h"
#include "tarnctl/teaming.h"

namespace TarnCtl::Network {

using Detail::Call;
using Detail::FormatArgs;
using Detail::Named;
using Detail::Refused;
using Detail::Session;
using Detail::Transaction;
namespace HN = HostCtl::Network;

namespace {

int64_t Count(Session& session, const char* sql, const std::string& name) {
  auto count = session.Prepare(sql);
  count.Bind(1, name).Step();
  return count.Int(0);
}

void RemoveStandard(Session& session, const std::string& name) {
  const int64_t used =
      Count(session,
            "SELECT count(*) FROM portgroup p JOIN client c ON c.portgroup = p.name"
            " WHERE p.layer = 1 AND p.switch = ?",
            name);
  if (used > 0) {
    throw Refused("Virtual switch " + name + " has " + std::to_string(used) + " ports in use");
  }
  Transaction transaction(session);
  for (const char* sql :
       {"DELETE FROM vswitch WHERE name = ?", "DELETE FROM portgroup WHERE switch = ?",
        "DELETE FROM link WHERE switch = ?", "DELETE FROM ens WHERE portset = ?"}) {
    session.Prepare(sql).Bind(1, name).Run();
  }
  transaction.Commit();
}

void RemoveDistributed(Session& session, const std::string& name, const std::string& portset) {
  const int64_t used =
      Count(session, "SELECT count(DISTINCT port_id) FROM dvport_client WHERE dvs = ?", name);
  if (used > 0) {
    throw Refused("DVS " + name + " has " + std::to_string(used) + " ports in use");
  }
  Transaction transaction(session);
  for (const char* sql :
       {"DELETE FROM dvswitch WHERE name = ?", "DELETE FROM dvs_uplink WHERE dvs = ?",
        "DELETE FROM dvport WHERE dvs = ?"}) {
    session.Prepare(sql).Bind(1, name).Run();
  }
  session.Prepare("DELETE FROM ens WHERE portset = ?").Bind(1, portset).Run();
  transaction.Commit();
}

}  // namespace

VirtualSwitchInfoImpl::VirtualSwitchInfoImpl()
    : state_(std::make_unique<State>(State{Session::Acquire()})) {
  Call call(state_->session.get(), "VirtualSwitchInfoImpl", Detail::Nothing(), "");
}

VirtualSwitchInfoImpl::VirtualSwitchInfoImpl(std::unique_ptr<State> state)
    : state_(std::move(state)) {}

VirtualSwitchInfoImpl::~VirtualSwitchInfoImpl() = default;

void VirtualSwitchInfoImpl::Refresh() {
  Call call(state_->session.get(), "Refresh", Detail::Nothing(), "");
}

std::unique_ptr<HN::VirtualSwitch> VirtualSwitchInfoImpl::AddVirtualSwitch(
    const HN::NicTeamingPolicy& teaming, const HN::PortSecurityPolicy& security,
    const HN::ShapingPolicy& shaping, const HN::NicCapabilities& capabilities,
    const std::string& name, int32_t numPorts) {
  Session& session = *state_->session;
  Call call(&session, "AddVirtualSwitch", Named(name),
            FormatArgs(teaming, security, shaping, capabilities, name, numPorts));
  Detail::CheckNewSwitchName(session, name);
  Detail::CheckPorts(numPorts);
  Detail::CheckTeamingPolicy(teaming);
  const Detail::StandardRow row{static_cast<uint32_t>(numPorts), Detail::kDefaultMtu,
                                Detail::kDefaultCdpStatus, false,
                                Detail::EncodeTeamingPolicy(teaming)};
  Transaction transaction(session);
  // A stored switch of that name that is not running is replaced whole.
  for (const char* sql : {"DELETE FROM vswitch WHERE layer = 0 AND name = ?",
                          "DELETE FROM portgroup WHERE layer = 0 AND switch = ?",
                          "DELETE FROM link WHERE layer = 0 AND switch = ?"}) {
    session.Prepare(sql).Bind(1, name).Run();
  }
  const int64_t seq = session.NextSeq();
  for (int64_t layer : {0, 1}) {
    session
        .Prepare(
            "INSERT INTO vswitch(layer, name, seq, num_ports, mtu, cdp, system, policy)"
            " VALUES (?, ?, ?, ?, ?, ?, 0, ?)")
        .Bind(1, layer)
        .Bind(2, name)
        .Bind(3, seq)
        .Bind(4, row.numPorts)
        .Bind(5, row.mtu)
        .Bind(6, row.cdp)
        .Bind(7, row.policy)
        .Run();
  }
  transaction.Commit();
  return Detail::MakeVirtualSwitch(state_->session, name, row);
}

void VirtualSwitchInfoImpl::RemoveVirtualSwitch(const std::string& name) {
  Session& session = *state_->session;
  Call call(&session, "RemoveVirtualSwitch", Named(name), FormatArgs(name));
  if (session.Prepare("SELECT 1 FROM vswitch WHERE layer = 1 AND name = ?").Bind(1, name).Step()) {
    RemoveStandard(session, name);
    return;
  }
  {
    auto dvs = session.Prepare("SELECT portset FROM dvswitch WHERE layer = 1 AND name = ?");
    if (dvs.Bind(1, name).Step()) {
      const std::string portset = dvs.Text(0);
      RemoveDistributed(session, name, portset);
      return;
    }
  }
  if (session.Prepare("SELECT 1 FROM opaque WHERE name = ?").Bind(1, name).Step()) {
    throw Refused("Opaque switch " + name + " cannot be removed",
                  "(it belongs to another control plane)");
  }
  throw Refused("Virtual switch " + name + " does not exist", "on this host");
}

std::vector<std::unique_ptr<HN::VirtualSwitch>> VirtualSwitchInfoImpl::GetVirtualSwitches(
    bool system) {
  Session& session = *state_->session;
  Call call(&session, "GetVirtualSwitches", Detail::Nothing(), FormatArgs(system));
  std::vector<std::unique_ptr<HN::VirtualSwitch>> switches;
  auto select = session.Prepare(
      "SELECT name, num_ports, mtu, cdp, system, policy FROM vswitch"
      " WHERE layer = 1 AND system = ? ORDER BY seq");
  select.Bind(1, system ? 1 : 0);
  while (select.Step()) {
    switches.push_back(Detail::MakeVirtualSwitch(state_->session, select.Text(0),
                                                 Detail::StandardState::Read(select, 1)));
  }
  return switches;
}

std::vector<std::unique_ptr<HN::DVSwitch>> VirtualSwitchInfoImpl::GetDVSwitches() {
  Session& session = *state_->session;
  Call call(&session, "GetDVSwitches", Detail::Nothing(), "");
  std::vector<std::string> names;
  {
    auto select = session.Prepare("SELECT name FROM dvswitch WHERE layer = 1 ORDER BY seq");
    while (select.Step()) names.push_back(select.Text(0));
  }
  std::vector<std::unique_ptr<HN::DVSwitch>> switches;
  for (const std::string& name : names) {
    switches.push_back(Detail::FindDVSwitch(state_->session, name));
  }
  return switches;
}

std::vector<std::unique_ptr<HN::DVSwitch>> VirtualSwitchInfoImpl::GetOpaqueSwitches() {
  Session& session = *state_->session;
  Call call(&session, "GetOpaqueSwitches", Detail::Nothing(), "");
  std::vector<std::unique_ptr<HN::DVSwitch>> switches;
  auto select = session.Prepare("SELECT name, portset FROM opaque ORDER BY seq");
  while (select.Step()) {
    switches.push_back(std::make_unique<Detail::OpaqueSwitchImpl>(
        Detail::MakeOpaqueState(state_->session, select.Text(0), select.Text(1))));
  }
  return switches;
}

bool VirtualSwitchInfoImpl::SwitchExists(const std::string& name) {
  Session& session = *state_->session;
  Call call(&session, "SwitchExists", Named(name), FormatArgs(name));
  return session.Prepare("SELECT 1 FROM vswitch WHERE layer = 1 AND name = ?").Bind(1, name).Step();
}

}  // namespace TarnCtl::Network
