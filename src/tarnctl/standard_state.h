// The state of a standard switch object: its name, and a snapshot of its
// running row.
#pragma once

#include "tarnctl/portset_state.h"
#include "tarnctl/snapshot.h"

namespace TarnCtl::Detail {

struct StandardRow {
  uint32_t numPorts = 0;
  uint32_t mtu = 0;
  int32_t cdp = 0;
  bool system = false;
  std::string policy;  // policy_codec.h
};

class StandardState : public Network::PortsetImpl::State {
 public:
  StandardState(std::shared_ptr<Session> session, std::string name);
  StandardState(std::shared_ptr<Session> session, std::string name, StandardRow row);

  // The running row; refuses when the switch no longer exists.
  const StandardRow& Row();
  const std::string& name() const { return name_; }

  Target CallTarget() const override { return On(name_); }
  std::string Name() override { return name_; }
  uint32_t NumPorts() override { return Row().numPorts; }
  uint32_t ConfiguredPorts() override { return Row().numPorts; }
  uint32_t UsedPorts() override;
  std::vector<std::string> Uplinks() override;
  std::string EnsName(bool change) override;

  // The columns of a StandardRow in a query, and the row read from them.
  static constexpr const char* kColumns = "num_ports, mtu, cdp, system, policy";
  static StandardRow Read(const Statement& select, int first);

 private:
  std::string name_;
  Snapshot<StandardRow> row_;
};

// The standard switch state behind a standard switch object.
inline StandardState& AsStandard(Network::PortsetImpl::State& state) {
  return static_cast<StandardState&>(state);
}

}  // namespace TarnCtl::Detail
