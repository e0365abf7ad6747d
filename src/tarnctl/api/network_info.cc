// The network information object: the run's hold on the host.
#include "hostctl/tarnctl.h"
#include "tarnctl/api/info_state.h"
#include "tarnctl/instrument/call.h"
#include "tarnctl/store/portgroups.h"

namespace TarnCtl::Network {

const std::string NetworkInfoImpl::DefaultDVSCacheFile = "/etc/tarnhost/dvs-cache.db";

NetworkInfoImpl::NetworkInfoImpl()
    : state_(std::make_unique<State>(State{Api::Session::Acquire()})) {
  TARN_CALL(&state_->db(), NetworkInfoImpl, Instrument::Nothing());
}

NetworkInfoImpl::~NetworkInfoImpl() = default;

std::unique_ptr<HostCtl::Network::VirtualSwitchInfo> NetworkInfoImpl::GetVirtualSwitchInfo() {
  TARN_CALL(&state_->db(), GetVirtualSwitchInfo, Instrument::Nothing());
  return std::make_unique<VirtualSwitchInfoImpl>(std::make_unique<VirtualSwitchInfoImpl::State>(
      VirtualSwitchInfoImpl::State{state_->session}));
}

std::set<std::string> NetworkInfoImpl::GetAllPortGroupNames(HostCtl::Network::PortsetGetType type) {
  TARN_CALL(&state_->db(), GetAllPortGroupNames, Instrument::Nothing(), static_cast<int>(type));
  const auto names = Store::PortGroups::Names(state_->db(), Store::Layer::kRunning);
  return {names.begin(), names.end()};
}

}  // namespace TarnCtl::Network
