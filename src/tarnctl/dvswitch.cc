// Distributed switches: DVPorts, uplinks on DVPorts, MTU. Changes go to the
// running state and the cache.
#include "tarnctl/dvswitch.h"

#include "tarnctl/call.h"
#include "tarnctl/checks.h"
#include "tarnctl/distributed_state.h"
#include "tarnctl/dvport_state.h"
#include "tarnctl/errors.h"
#include "tarnctl/names.h"

namespace TarnCtl::Detail {

using HostCtl::Network::DVPortParam;

namespace {

DistributedState& Distributed(Network::PortsetImpl::State& state) {
  return static_cast<DistributedState&>(state);
}

// The DVPorts of switch `dvs`, in the order they were made.
std::vector<DVPortParam> PortParams(Session& session, const std::string& dvs,
                                    const std::string& switchId) {
  std::vector<DVPortParam> params;
  auto select =
      session.Prepare("SELECT port_id, connection_id FROM dvport WHERE dvs = ? ORDER BY seq");
  select.Bind(1, dvs);
  while (select.Step()) {
    params.push_back({switchId, select.Text(0), static_cast<uint32_t>(select.Int(1))});
  }
  return params;
}

}  // namespace

DVSwitchImpl::DVSwitchImpl(std::unique_ptr<PortsetImpl::State> state)
    : PortsetImpl(std::move(state)) {}

DVSwitchImpl::~DVSwitchImpl() = default;

void DVSwitchImpl::AddDVPortUplink(const std::string& uplink, DVPortParam port) {
  DistributedState& dvs = Distributed(*state_);
  Call call(dvs.session.get(), "AddDVPortUplink", dvs.CallTarget(), FormatArgs(uplink, port));
  const DistributedRow row = dvs.Row();
  Session& session = *dvs.session;
  if (port.switchId != row.switchId) {
    throw Refused("DVPort " + port.portId + " does not belong to DVS " + dvs.name(),
                  "(switch id " + port.switchId + ")");
  }
  auto current = session.Prepare("SELECT connection_id FROM dvport WHERE dvs = ? AND port_id = ?");
  if (!current.Bind(1, dvs.name()).Bind(2, port.portId).Step()) {
    throw Refused("DVPort " + port.portId + " does not exist", "on DVS " + dvs.name());
  }
  const int64_t connectionId = current.Int(0);
  if (port.connectionId == 0 || port.connectionId != connectionId) {
    throw Refused(
        "Stale connection id " + std::to_string(port.connectionId) + " for DVPort " + port.portId,
        "(the port's connection id is " + std::to_string(connectionId) + ")");
  }
  CheckFreePnic(session, uplink);
  Transaction transaction(session);
  const int64_t seq = session.NextSeq();
  for (int64_t layer : {0, 1}) {
    session
        .Prepare(
            "INSERT OR REPLACE INTO dvs_uplink(layer, pnic, dvs, port_id, seq)"
            " VALUES (?, ?, ?, ?, ?)")
        .Bind(1, layer)
        .Bind(2, uplink)
        .Bind(3, dvs.name())
        .Bind(4, port.portId)
        .Bind(5, seq)
        .Run();
  }
  transaction.Commit();
}

void DVSwitchImpl::RemoveDVPortUplink(const std::string& uplink, int reserved) {
  DistributedState& dvs = Distributed(*state_);
  Call call(dvs.session.get(), "RemoveDVPortUplink", dvs.CallTarget(),
            FormatArgs(uplink, reserved));
  dvs.Row();
  Session& session = *dvs.session;
  if (!session.Prepare("SELECT 1 FROM dvs_uplink WHERE layer = 1 AND pnic = ? AND dvs = ?")
           .Bind(1, uplink)
           .Bind(2, dvs.name())
           .Step()) {
    throw Refused(uplink + " is not an uplink of DVS " + dvs.name());
  }
  Transaction transaction(session);
  session.Prepare("DELETE FROM dvs_uplink WHERE pnic = ? AND dvs = ?")
      .Bind(1, uplink)
      .Bind(2, dvs.name())
      .Run();
  transaction.Commit();
}

std::vector<std::unique_ptr<HostCtl::Network::DVPort>> DVSwitchImpl::GetDVPorts() {
  DistributedState& dvs = Distributed(*state_);
  Call call(dvs.session.get(), "GetDVPorts", dvs.CallTarget(), "");
  const std::string switchId = dvs.Row().switchId;
  std::vector<std::unique_ptr<HostCtl::Network::DVPort>> ports;
  for (DVPortParam& param : PortParams(*dvs.session, dvs.name(), switchId)) {
    ports.push_back(
        std::make_unique<Network::DVPortImpl>(std::make_unique<Network::DVPortImpl::State>(
            Network::DVPortImpl::State{dvs.session, std::move(param), dvs.name()})));
  }
  return ports;
}

std::string DVSwitchImpl::GetDVSwitchId() {
  DistributedState& dvs = Distributed(*state_);
  Call call(dvs.session.get(), "GetDVSwitchId", dvs.CallTarget(), "");
  return dvs.Row().switchId;
}

std::string DVSwitchImpl::GetSwitchName() {
  DistributedState& dvs = Distributed(*state_);
  Call call(dvs.session.get(), "GetSwitchName", dvs.CallTarget(), "");
  return dvs.name();
}

uint32_t DVSwitchImpl::GetMTU() {
  DistributedState& dvs = Distributed(*state_);
  Call call(dvs.session.get(), "GetMTU", dvs.CallTarget(), "");
  return dvs.Row().mtu;
}

void DVSwitchImpl::SetMTU(uint16_t mtu) {
  DistributedState& dvs = Distributed(*state_);
  Call call(dvs.session.get(), "SetMTU", dvs.CallTarget(), FormatArgs(mtu));
  dvs.Row();
  CheckMtu(mtu);
  Transaction transaction(*dvs.session);
  dvs.session->Prepare("UPDATE dvswitch SET mtu = ? WHERE name = ?")
      .Bind(1, mtu)
      .Bind(2, dvs.name())
      .Run();
  transaction.Commit();
}

std::map<std::string, DVPortParam> DVSwitchImpl::GetDVPortParams() {
  DistributedState& dvs = Distributed(*state_);
  Call call(dvs.session.get(), "GetDVPortParams", dvs.CallTarget(), "");
  const std::string switchId = dvs.Row().switchId;
  std::map<std::string, DVPortParam> params;
  for (DVPortParam& param : PortParams(*dvs.session, dvs.name(), switchId)) {
    params.emplace(param.portId, std::move(param));
  }
  return params;
}

}  // namespace TarnCtl::Detail
