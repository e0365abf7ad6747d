// The state of a distributed switch object: its switch name and portset
// name, and a snapshot of its running row.
#pragma once

#include "tarnctl/portset_state.h"
#include "tarnctl/snapshot.h"

namespace TarnCtl::Detail {

struct DistributedRow {
  std::string switchId;
  uint32_t numPorts = 0;
  uint32_t mtu = 0;
};

class DistributedState : public Network::PortsetImpl::State {
 public:
  DistributedState(std::shared_ptr<Session> session, std::string name, std::string portset);

  // The running row; refuses when the switch no longer exists.
  const DistributedRow& Row();
  const std::string& name() const { return name_; }

  Target CallTarget() const override { return On(name_, portset_); }
  std::string Name() override { return portset_; }
  uint32_t NumPorts() override { return Row().numPorts; }
  uint32_t ConfiguredPorts() override { return Row().numPorts; }
  uint32_t UsedPorts() override;
  std::vector<std::string> Uplinks() override;
  std::string EnsName(bool change) override;

 private:
  std::string name_;
  std::string portset_;
  Snapshot<DistributedRow> row_;
};

}  // namespace TarnCtl::Detail
