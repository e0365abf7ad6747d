#include "tarnctl/api/distributed_state.h"

#include "tarnctl/instrument/errors.h"
#include "tarnctl/model/limits.h"
#include "tarnctl/model/names.h"
#include "tarnctl/store/dvports.h"
#include "tarnctl/store/meta.h"

namespace TarnCtl::Api {

using HostCtl::Network::DVPortParam;
using Instrument::Refused;
using Store::Layer;

DistributedState::DistributedState(std::shared_ptr<Session> session, std::string name,
                                   std::string portset)
    : DVSwitchState(std::move(session)), name_(std::move(name)), portset_(std::move(portset)) {}

const Store::Distributed::Row& DistributedState::Row() {
  return row_.Get(db(), [this] {
    auto row = Store::Distributed::Find(db(), Layer::kRunning, name_);
    if (!row) throw Refused("DVS " + name_ + " does not exist", "on this host");
    return *std::move(row);
  });
}

uint32_t DistributedState::UsedPorts() {
  EnsureStillExists();
  return static_cast<uint32_t>(Store::Distributed::UsedPorts(db(), name_));
}

std::vector<std::string> DistributedState::Uplinks() {
  EnsureStillExists();
  std::vector<std::string> pnics;
  for (auto& uplink : Store::Distributed::Uplinks(db(), Layer::kRunning, name_)) {
    pnics.push_back(std::move(uplink.pnic));
  }
  return pnics;
}

std::string DistributedState::EnsName(bool) {
  EnsureStillExists();
  return portset_;
}

void DistributedState::AddDVPortUplink(const std::string& uplink, const DVPortParam& port) {
  const std::string switchId = Row().switchId;
  if (port.switchId != switchId) {
    throw Refused("DVPort " + port.portId + " does not belong to DVS " + name_,
                  "(switch id " + port.switchId + ")");
  }
  const auto connectionId = Store::DVPorts::ConnectionId(db(), name_, port.portId);
  if (!connectionId) {
    throw Refused("DVPort " + port.portId + " does not exist", "on DVS " + name_);
  }
  if (port.connectionId == 0 || port.connectionId != *connectionId) {
    throw Refused(
        "Stale connection id " + std::to_string(port.connectionId) + " for DVPort " + port.portId,
        "(the port's connection id is " + std::to_string(*connectionId) + ")");
  }
  Model::CheckFreePnic(db(), uplink);
  const int64_t seq = Store::Meta::NextSeq(db());
  for (Layer layer : Store::kBothLayers) {
    Store::Distributed::AddUplink(db(), layer, name_, {uplink, port.portId}, seq);
  }
}

void DistributedState::RemoveDVPortUplink(const std::string& uplink) {
  EnsureStillExists();
  if (!Store::Distributed::HasUplink(db(), Layer::kRunning, name_, uplink)) {
    throw Refused(uplink + " is not an uplink of DVS " + name_);
  }
  Store::Distributed::RemoveUplink(db(), name_, uplink);
}

std::vector<DVPortParam> DistributedState::DVPorts() {
  const std::string switchId = Row().switchId;
  std::vector<DVPortParam> params;
  for (auto& port : Store::DVPorts::OnSwitch(db(), name_)) {
    params.push_back({switchId, std::move(port.portId), port.connectionId});
  }
  return params;
}

void DistributedState::SetMtu(uint16_t mtu) {
  EnsureStillExists();
  Model::Check(Model::kMtu, mtu);
  Store::Distributed::SetMtu(db(), name_, mtu);
}

}  // namespace TarnCtl::Api
