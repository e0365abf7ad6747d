// The distributed switch interface, over the state of the switch's kind.
#include "tarnctl/api/dvswitch.h"

#include "tarnctl/api/dvport_state.h"

namespace TarnCtl::Api {

using HostCtl::Network::DVPortParam;

DVSwitchImpl::DVSwitchImpl(std::unique_ptr<DVSwitchState> state) : PortsetImpl(std::move(state)) {}

DVSwitchImpl::~DVSwitchImpl() = default;

void DVSwitchImpl::AddDVPortUplink(const std::string& uplink, DVPortParam port) {
  TARN_CALL_ON(Dvs(), AddDVPortUplink, uplink, port);
  Dvs().AddDVPortUplink(uplink, port);
}

void DVSwitchImpl::RemoveDVPortUplink(const std::string& uplink, int reserved) {
  TARN_CALL_ON(Dvs(), RemoveDVPortUplink, uplink, reserved);
  Dvs().RemoveDVPortUplink(uplink);
}

std::vector<std::unique_ptr<HostCtl::Network::DVPort>> DVSwitchImpl::GetDVPorts() {
  TARN_CALL_ON(Dvs(), GetDVPorts);
  std::vector<std::unique_ptr<HostCtl::Network::DVPort>> ports;
  for (DVPortParam& param : Dvs().DVPorts()) {
    ports.push_back(
        std::make_unique<Network::DVPortImpl>(std::make_unique<Network::DVPortImpl::State>(
            Network::DVPortImpl::State{Dvs().session, std::move(param), Dvs().SwitchName()})));
  }
  return ports;
}

std::string DVSwitchImpl::GetDVSwitchId() {
  TARN_CALL_ON(Dvs(), GetDVSwitchId);
  return Dvs().SwitchId();
}

std::string DVSwitchImpl::GetSwitchName() {
  TARN_CALL_ON(Dvs(), GetSwitchName);
  return Dvs().SwitchName();
}

uint32_t DVSwitchImpl::GetMTU() {
  TARN_CALL_ON(Dvs(), GetMTU);
  return Dvs().Mtu();
}

void DVSwitchImpl::SetMTU(uint16_t mtu) {
  TARN_CALL_ON(Dvs(), SetMTU, mtu);
  Dvs().SetMtu(mtu);
}

std::map<std::string, DVPortParam> DVSwitchImpl::GetDVPortParams() {
  TARN_CALL_ON(Dvs(), GetDVPortParams);
  std::map<std::string, DVPortParam> params;
  for (DVPortParam& param : Dvs().DVPorts()) params.emplace(param.portId, std::move(param));
  return params;
}

}  // namespace TarnCtl::Api
