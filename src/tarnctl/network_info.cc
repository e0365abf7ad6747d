// The network information object: the run's hold on the host.
#include "hostctl/tarnctl.h"
#include "tarnctl/call.h"
#include "tarnctl/info_state.h"

namespace TarnCtl::Network {

using Detail::Call;
using Detail::Session;

NetworkInfoImpl::NetworkInfoImpl() : state_(std::make_unique<State>(State{Session::Acquire()})) {
  Call call(state_->session.get(), "NetworkInfoImpl", Detail::Nothing(), "");
}

NetworkInfoImpl::~NetworkInfoImpl() = default;

std::unique_ptr<HostCtl::Network::VirtualSwitchInfo> NetworkInfoImpl::GetVirtualSwitchInfo() {
  Call call(state_->session.get(), "GetVirtualSwitchInfo", Detail::Nothing(), "");
  return std::make_unique<VirtualSwitchInfoImpl>(std::make_unique<VirtualSwitchInfoImpl::State>(
      VirtualSwitchInfoImpl::State{state_->session}));
}

std::set<std::string> NetworkInfoImpl::GetAllPortGroupNames(HostCtl::Network::PortsetGetType type) {
  Call call(state_->session.get(), "GetAllPortGroupNames", Detail::Nothing(),
            Detail::FormatArgs(static_cast<int>(type)));
  std::set<std::string> names;
  auto select = state_->session->Prepare("SELECT name FROM portgroup WHERE layer = 1");
  while (select.Step()) names.insert(select.Text(0));
  return names;
}

}  // namespace TarnCtl::Network
