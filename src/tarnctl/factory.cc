// Static lookups of switches and portsets (running state), and the makers
// of switch objects the rest of the library shares.
#include "hostctl/network.h"
#include "tarnctl/call.h"
#include "tarnctl/distributed_state.h"
#include "tarnctl/dvswitch.h"
#include "tarnctl/errors.h"
#include "tarnctl/names.h"
#include "tarnctl/switches.h"

namespace TarnCtl::Detail {

std::unique_ptr<HostCtl::Network::VirtualSwitch> MakeVirtualSwitch(std::shared_ptr<Session> session,
                                                                   std::string name,
                                                                   StandardRow row) {
  return std::make_unique<Network::VirtualSwitchImpl>(
      std::make_unique<StandardState>(std::move(session), std::move(name), std::move(row)));
}

std::unique_ptr<HostCtl::Network::DVSwitch> FindDVSwitch(std::shared_ptr<Session> session,
                                                         const std::string& name) {
  auto select = session->Prepare("SELECT portset FROM dvswitch WHERE layer = 1 AND name = ?");
  if (!select.Bind(1, name).Step()) return nullptr;
  return std::make_unique<DVSwitchImpl>(
      std::make_unique<DistributedState>(session, name, select.Text(0)));
}

}  // namespace TarnCtl::Detail

namespace HostCtl::Network {

using TarnCtl::Detail::Call;
using TarnCtl::Detail::FormatArgs;
using TarnCtl::Detail::Named;
using TarnCtl::Detail::Refused;
using TarnCtl::Detail::Session;

std::unique_ptr<VirtualSwitch> NetworkFactory::GetVirtualSwitchById(const std::string& name,
                                                                    PortsetGetType type) {
  const auto session = Session::Acquire();
  Call call(session.get(), "GetVirtualSwitchById", Named(name),
            FormatArgs(name, static_cast<int>(type)));
  auto select = session->Prepare(
      "SELECT num_ports, mtu, cdp, system, policy FROM vswitch WHERE layer = 1 AND name = ?");
  if (!select.Bind(1, name).Step()) {
    throw Refused("Virtual switch " + name + " does not exist", "on this host");
  }
  return TarnCtl::Detail::MakeVirtualSwitch(session, name,
                                            TarnCtl::Detail::StandardState::Read(select, 0));
}

std::unique_ptr<Portset> NetworkFactory::GetPortsetById(const std::string& name) {
  const auto session = Session::Acquire();
  Call call(session.get(), "GetPortsetById", Named(name), FormatArgs(name));
  const auto found = TarnCtl::Detail::FindPortset(*session, name);
  if (!found) throw Refused("Portset " + name + " does not exist", "on this host");
  switch (found->kind) {
    case TarnCtl::Detail::PortsetKind::kStandard:
      return std::make_unique<TarnCtl::Network::VirtualSwitchImpl>(
          std::make_unique<TarnCtl::Detail::StandardState>(session, name));
    case TarnCtl::Detail::PortsetKind::kDistributed:
      return TarnCtl::Detail::FindDVSwitch(session, found->name);
    case TarnCtl::Detail::PortsetKind::kOpaque:
      break;
  }
  return TarnCtl::Detail::FindOpaqueSwitch(session, found->name);
}

std::unique_ptr<DVSwitch> NetworkFactory::GetDVSwitchByName(const std::string& name) {
  const auto session = Session::Acquire();
  Call call(session.get(), "GetDVSwitchByName", Named(name), FormatArgs(name));
  auto dvs = TarnCtl::Detail::FindDVSwitch(session, name);
  if (!dvs) throw Refused("DVS " + name + " does not exist", "on this host");
  return dvs;
}

}  // namespace HostCtl::Network
