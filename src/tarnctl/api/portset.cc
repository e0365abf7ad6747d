// Portset operations shared by standard, distributed and opaque switches;
// each kind answers through its State.
#include "hostctl/tarnctl.h"
#include "tarnctl/api/portset_state.h"
#include "tarnctl/store/names.h"

namespace TarnCtl::Network {

PortsetImpl::PortsetImpl(std::unique_ptr<State> state) : state_(std::move(state)) {}

PortsetImpl::~PortsetImpl() = default;

bool PortsetImpl::IsValidVirtualSwitch(const std::string& name) {
  const auto session = Api::Session::Acquire();
  TARN_CALL(&session->db(), IsValidVirtualSwitch, Instrument::Named(name), name);
  return Store::Names::VirtualSwitchExists(session->db(), name);
}

std::string PortsetImpl::GetName() {
  TARN_CALL_ON(*state_, GetName);
  return state_->Name();
}

uint32_t PortsetImpl::GetNumPorts() {
  TARN_CALL_ON(*state_, GetNumPorts);
  return state_->NumPorts();
}

uint32_t PortsetImpl::GetConfiguredPorts() {
  TARN_CALL_ON(*state_, GetConfiguredPorts);
  return state_->ConfiguredPorts();
}

uint32_t PortsetImpl::GetUsedPorts() {
  TARN_CALL_ON(*state_, GetUsedPorts);
  return state_->UsedPorts();
}

std::vector<std::string> PortsetImpl::GetUplinks() {
  TARN_CALL_ON(*state_, GetUplinks);
  return state_->Uplinks();
}

}  // namespace TarnCtl::Network
