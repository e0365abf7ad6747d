#include "tarnctl/distributed_state.h"

#include "tarnctl/errors.h"

namespace TarnCtl::Detail {

DistributedState::DistributedState(std::shared_ptr<Session> session, std::string name,
                                   std::string portset)
    : State(std::move(session)), name_(std::move(name)), portset_(std::move(portset)) {}

const DistributedRow& DistributedState::Row() {
  return row_.Get(*session, [this] {
    auto select = session->Prepare(
        "SELECT switch_id, num_ports, mtu FROM dvswitch WHERE layer = 1 AND name = ?");
    if (!select.Bind(1, name_).Step()) {
      throw Refused("DVS " + name_ + " does not exist", "on this host");
    }
    return DistributedRow{select.Text(0), static_cast<uint32_t>(select.Int(1)),
                          static_cast<uint32_t>(select.Int(2))};
  });
}

uint32_t DistributedState::UsedPorts() {
  Row();
  auto count = session->Prepare(
      "SELECT (SELECT count(*) FROM dvs_uplink WHERE layer = 1 AND dvs = ?1)"
      " + (SELECT count(DISTINCT port_id) FROM dvport_client WHERE dvs = ?1)");
  count.Bind(1, name_).Step();
  return static_cast<uint32_t>(count.Int(0));
}

std::vector<std::string> DistributedState::Uplinks() {
  Row();
  std::vector<std::string> uplinks;
  auto select =
      session->Prepare("SELECT pnic FROM dvs_uplink WHERE layer = 1 AND dvs = ? ORDER BY seq");
  select.Bind(1, name_);
  while (select.Step()) uplinks.push_back(select.Text(0));
  return uplinks;
}

std::string DistributedState::EnsName(bool) {
  Row();
  return portset_;
}

}  // namespace TarnCtl::Detail
