// The switch information object: creation, removal and lists of switches.
#include "hostctl/tarnctl.h"
#include "tarnctl/api/create.h"
#include "tarnctl/api/dvswitch.h"
#include "tarnctl/api/info_state.h"
#include "tarnctl/api/remove.h"
#include "tarnctl/api/switches.h"
#include "tarnctl/instrument/call.h"
#include "tarnctl/instrument/errors.h"
#include "tarnctl/store/distributed.h"
#include "tarnctl/store/opaque.h"

namespace TarnCtl::Network {

using Instrument::Named;
using Instrument::Nothing;
using Instrument::Refused;
using Store::Layer;
namespace HN = HostCtl::Network;

VirtualSwitchInfoImpl::VirtualSwitchInfoImpl()
    : state_(std::make_unique<State>(State{Api::Session::Acquire()})) {
  TARN_CALL(&state_->db(), VirtualSwitchInfoImpl, Nothing());
}

VirtualSwitchInfoImpl::VirtualSwitchInfoImpl(std::unique_ptr<State> state)
    : state_(std::move(state)) {}

VirtualSwitchInfoImpl::~VirtualSwitchInfoImpl() = default;

void VirtualSwitchInfoImpl::Refresh() {
  TARN_CALL(&state_->db(), Refresh, Nothing());
}

std::unique_ptr<HN::VirtualSwitch> VirtualSwitchInfoImpl::AddVirtualSwitch(
    const HN::NicTeamingPolicy& teaming, const HN::PortSecurityPolicy& security,
    const HN::ShapingPolicy& shaping, const HN::NicCapabilities& capabilities,
    const std::string& name, int32_t numPorts) {
  Store::Db& db = state_->db();
  TARN_CALL(&db, AddVirtualSwitch, Named(name), teaming, security, shaping, capabilities, name,
            numPorts);
  auto row = Api::CreateStandardSwitch(db, name, numPorts, teaming, false);
  return Api::MakeVirtualSwitch(state_->session, name, std::move(row));
}

void VirtualSwitchInfoImpl::RemoveVirtualSwitch(const std::string& name) {
  Store::Db& db = state_->db();
  TARN_CALL(&db, RemoveVirtualSwitch, Named(name), name);
  if (Store::Standard::Exists(db, Layer::kRunning, name))
    return Api::RemoveStandardSwitch(db, name);
  if (const auto dvs = Store::Distributed::Find(db, Layer::kRunning, name)) {
    return Api::RemoveDVSwitch(db, name, dvs->portset);
  }
  if (Store::Opaque::Find(db, name)) {
    throw Refused("Opaque switch " + name + " cannot be removed",
                  "(it belongs to another control plane)");
  }
  throw Refused("Virtual switch " + name + " does not exist", "on this host");
}

std::vector<std::unique_ptr<HN::VirtualSwitch>> VirtualSwitchInfoImpl::GetVirtualSwitches(
    bool system) {
  TARN_CALL(&state_->db(), GetVirtualSwitches, Nothing(), system);
  std::vector<std::unique_ptr<HN::VirtualSwitch>> switches;
  for (auto& sw : Store::Standard::List(state_->db(), Layer::kRunning, system)) {
    switches.push_back(
        Api::MakeVirtualSwitch(state_->session, std::move(sw.name), std::move(sw.row)));
  }
  return switches;
}

std::vector<std::unique_ptr<HN::DVSwitch>> VirtualSwitchInfoImpl::GetDVSwitches() {
  TARN_CALL(&state_->db(), GetDVSwitches, Nothing());
  std::vector<std::unique_ptr<HN::DVSwitch>> switches;
  for (const auto& dvs : Store::Distributed::List(state_->db(), Layer::kRunning)) {
    switches.push_back(Api::FindDVSwitch(state_->session, dvs.name));
  }
  return switches;
}

std::vector<std::unique_ptr<HN::DVSwitch>> VirtualSwitchInfoImpl::GetOpaqueSwitches() {
  TARN_CALL(&state_->db(), GetOpaqueSwitches, Nothing());
  std::vector<std::unique_ptr<HN::DVSwitch>> switches;
  for (const auto& opaque : Store::Opaque::List(state_->db())) {
    switches.push_back(Api::MakeOpaqueSwitch(state_->session, opaque.name, opaque.row.portset));
  }
  return switches;
}

bool VirtualSwitchInfoImpl::SwitchExists(const std::string& name) {
  TARN_CALL(&state_->db(), SwitchExists, Named(name), name);
  return Store::Standard::Exists(state_->db(), Layer::kRunning, name);
}

}  // namespace TarnCtl::Network
