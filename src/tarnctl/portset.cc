// Portset operations shared by standard, distributed and opaque switches;
// each kind answers through its State.
#include "hostctl/tarnctl.h"
#include "tarnctl/call.h"
#include "tarnctl/portset_state.h"

namespace TarnCtl::Network {

using Detail::Call;
using Detail::Session;

PortsetImpl::PortsetImpl(std::unique_ptr<State> state) : state_(std::move(state)) {}

PortsetImpl::~PortsetImpl() = default;

bool PortsetImpl::IsValidVirtualSwitch(const std::string& name) {
  const auto session = Session::Acquire();
  Call call(session.get(), "IsValidVirtualSwitch", Detail::Named(name), Detail::FormatArgs(name));
  return session
      ->Prepare(
          "SELECT 1 FROM vswitch WHERE layer = 1 AND name = ?1"
          " UNION ALL SELECT 1 FROM dvswitch WHERE layer = 1 AND name = ?1")
      .Bind(1, name)
      .Step();
}

std::string PortsetImpl::GetName() {
  Call call(state_->session.get(), "GetName", state_->CallTarget(), "");
  return state_->Name();
}

uint32_t PortsetImpl::GetNumPorts() {
  Call call(state_->session.get(), "GetNumPorts", state_->CallTarget(), "");
  return state_->NumPorts();
}

uint32_t PortsetImpl::GetConfiguredPorts() {
  Call call(state_->session.get(), "GetConfiguredPorts", state_->CallTarget(), "");
  return state_->ConfiguredPorts();
}

uint32_t PortsetImpl::GetUsedPorts() {
  Call call(state_->session.get(), "GetUsedPorts", state_->CallTarget(), "");
  return state_->UsedPorts();
}

std::vector<std::string> PortsetImpl::GetUplinks() {
  Call call(state_->session.get(), "GetUplinks", state_->CallTarget(), "");
  return state_->Uplinks();
}

}  // namespace TarnCtl::Network
