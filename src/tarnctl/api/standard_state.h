// The state of a standard switch object: its name, and a snapshot of its
// running row.
#pragma once

#include "tarnctl/api/portset_state.h"
#include "tarnctl/store/snapshot.h"
#include "tarnctl/store/standard.h"

namespace TarnCtl::Api {

class StandardState : public Network::PortsetImpl::State {
 public:
  StandardState(std::shared_ptr<Session> session, std::string name);
  StandardState(std::shared_ptr<Session> session, std::string name, Store::Standard::Row row);

  // The running row; refuses when the switch no longer exists.
  const Store::Standard::Row& Row();
  // Refuses when the switch no longer exists.
  void EnsureStillExists() { Row(); }
  const std::string& name() const { return name_; }

  Instrument::Target CallTarget() const override { return Instrument::On(name_); }
  std::string Name() override { return name_; }
  uint32_t NumPorts() override { return Row().numPorts; }
  uint32_t ConfiguredPorts() override { return Row().numPorts; }
  uint32_t UsedPorts() override;
  std::vector<std::string> Uplinks() override;
  std::string EnsName(bool change) override;

 private:
  std::string name_;
  Store::Snapshot<Store::Standard::Row> row_;
};

// The standard switch state behind a standard switch object.
inline StandardState& AsStandard(Network::PortsetImpl::State& state) {
  return static_cast<StandardState&>(state);
}

// Refuses the unknown standard switch `name`.
[[noreturn]] void NoSuchStandardSwitch(const std::string& name);

}  // namespace TarnCtl::Api
