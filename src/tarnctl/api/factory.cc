// Static lookups of switches and portsets (running state), and the makers
// of switch objects the rest of the library shares.
#include "hostctl/network.h"
#include "tarnctl/api/distributed_state.h"
#include "tarnctl/api/dvswitch.h"
#include "tarnctl/api/standard_state.h"
#include "tarnctl/api/switches.h"
#include "tarnctl/instrument/errors.h"
#include "tarnctl/model/names.h"

namespace TarnCtl::Api {

std::unique_ptr<HostCtl::Network::VirtualSwitch> MakeVirtualSwitch(std::shared_ptr<Session> session,
                                                                   std::string name,
                                                                   Store::Standard::Row row) {
  return std::make_unique<Network::VirtualSwitchImpl>(
      std::make_unique<StandardState>(std::move(session), std::move(name), std::move(row)));
}

std::unique_ptr<HostCtl::Network::DVSwitch> FindDVSwitch(std::shared_ptr<Session> session,
                                                         const std::string& name) {
  auto row = Store::Distributed::Find(session->db(), Store::Layer::kRunning, name);
  if (!row) return nullptr;
  return std::make_unique<DVSwitchImpl>(
      std::make_unique<DistributedState>(std::move(session), name, row->portset));
}

}  // namespace TarnCtl::Api

namespace HostCtl::Network {

using TarnCtl::Api::Session;
using TarnCtl::Instrument::Named;
using TarnCtl::Instrument::Refused;

std::unique_ptr<VirtualSwitch> NetworkFactory::GetVirtualSwitchById(const std::string& name,
                                                                    PortsetGetType type) {
  const auto session = Session::Acquire();
  TARN_CALL(&session->db(), GetVirtualSwitchById, Named(name), name, static_cast<int>(type));
  auto row = TarnCtl::Store::Standard::Find(session->db(), TarnCtl::Store::Layer::kRunning, name);
  if (!row) TarnCtl::Api::NoSuchStandardSwitch(name);
  return TarnCtl::Api::MakeVirtualSwitch(session, name, *std::move(row));
}

std::unique_ptr<Portset> NetworkFactory::GetPortsetById(const std::string& name) {
  const auto session = Session::Acquire();
  TARN_CALL(&session->db(), GetPortsetById, Named(name), name);
  const auto found = TarnCtl::Model::FindPortset(session->db(), name);
  if (!found) throw Refused("Portset " + name + " does not exist", "on this host");
  switch (found->kind) {
    case TarnCtl::Model::PortsetKind::kStandard:
      return std::make_unique<TarnCtl::Network::VirtualSwitchImpl>(
          std::make_unique<TarnCtl::Api::StandardState>(session, name));
    case TarnCtl::Model::PortsetKind::kDistributed:
      return TarnCtl::Api::FindDVSwitch(session, found->name);
    case TarnCtl::Model::PortsetKind::kOpaque:
      break;
  }
  return TarnCtl::Api::MakeOpaqueSwitch(session, found->name, found->portset);
}

std::unique_ptr<DVSwitch> NetworkFactory::GetDVSwitchByName(const std::string& name) {
  const auto session = Session::Acquire();
  TARN_CALL(&session->db(), GetDVSwitchByName, Named(name), name);
  auto dvs = TarnCtl::Api::FindDVSwitch(session, name);
  if (!dvs) throw Refused("DVS " + name + " does not exist", "on this host");
  return dvs;
}

}  // namespace HostCtl::Network
