#include "tarnctl/standard_state.h"

#include "tarnctl/errors.h"

namespace TarnCtl::Detail {

StandardState::StandardState(std::shared_ptr<Session> session, std::string name)
    : State(std::move(session)), name_(std::move(name)) {}

StandardState::StandardState(std::shared_ptr<Session> session, std::string name, StandardRow row)
    : State(std::move(session)), name_(std::move(name)), row_(*this->session, std::move(row)) {}

StandardRow StandardState::Read(const Statement& select, int first) {
  StandardRow row;
  row.numPorts = static_cast<uint32_t>(select.Int(first));
  row.mtu = static_cast<uint32_t>(select.Int(first + 1));
  row.cdp = static_cast<int32_t>(select.Int(first + 2));
  row.system = select.Int(first + 3) != 0;
  row.policy = select.Text(first + 4);
  return row;
}

const StandardRow& StandardState::Row() {
  return row_.Get(*session, [this] {
    auto select = session->Prepare(
        "SELECT num_ports, mtu, cdp, system, policy FROM vswitch WHERE layer = 1 AND name = ?");
    if (!select.Bind(1, name_).Step()) {
      throw Refused("Virtual switch " + name_ + " does not exist", "on this host");
    }
    return Read(select, 0);
  });
}

uint32_t StandardState::UsedPorts() {
  Row();
  auto count = session->Prepare(
      "SELECT (SELECT count(*) FROM link WHERE layer = 1 AND switch = ?1)"
      " + (SELECT count(*) FROM portgroup p JOIN client c ON c.portgroup = p.name"
      "    WHERE p.layer = 1 AND p.switch = ?1)");
  count.Bind(1, name_).Step();
  return static_cast<uint32_t>(count.Int(0));
}

std::vector<std::string> StandardState::Uplinks() {
  Row();
  std::vector<std::string> uplinks;
  auto select =
      session->Prepare("SELECT pnic FROM link WHERE layer = 1 AND switch = ? ORDER BY seq");
  select.Bind(1, name_);
  while (select.Step()) uplinks.push_back(select.Text(0));
  return uplinks;
}

std::string StandardState::EnsName(bool) {
  Row();
  return name_;
}

}  // namespace TarnCtl::Detail
