// The state of a distributed switch object: its switch name and portset
// name, and a snapshot of its running row.
#pragma once

#include "tarnctl/api/dvswitch.h"
#include "tarnctl/store/distributed.h"
#include "tarnctl/store/snapshot.h"

namespace TarnCtl::Api {

class DistributedState : public DVSwitchState {
 public:
  DistributedState(std::shared_ptr<Session> session, std::string name, std::string portset);

  // The running row; refuses when the switch no longer exists.
  const Store::Distributed::Row& Row();
  // Refuses when the switch no longer exists.
  void EnsureStillExists() { Row(); }
  const std::string& name() const { return name_; }

  Instrument::Target CallTarget() const override { return Instrument::On(name_, portset_); }
  std::string Name() override { return portset_; }
  uint32_t NumPorts() override { return Row().numPorts; }
  uint32_t ConfiguredPorts() override { return Row().numPorts; }
  uint32_t UsedPorts() override;
  std::vector<std::string> Uplinks() override;
  std::string EnsName(bool change) override;

  void AddDVPortUplink(const std::string& uplink,
                       const HostCtl::Network::DVPortParam& port) override;
  void RemoveDVPortUplink(const std::string& uplink) override;
  std::vector<HostCtl::Network::DVPortParam> DVPorts() override;
  std::string SwitchId() override { return Row().switchId; }
  std::string SwitchName() override { return name_; }
  uint32_t Mtu() override { return Row().mtu; }
  void SetMtu(uint16_t mtu) override;

 private:
  std::string name_;
  std::string portset_;
  Store::Snapshot<Store::Distributed::Row> row_;
};

}  // namespace TarnCtl::Api
