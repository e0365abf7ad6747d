// Opaque switches: switches of another control plane that this host only
// shows. They answer the portset and distributed switch reads (MTU 1500, no
// DVPorts, an empty switch id, configured ports = ports) and refuse every
// change.
#include "tarnctl/store/opaque.h"
#include "tarnctl/api/dvswitch.h"
#include "tarnctl/api/switches.h"
#include "tarnctl/instrument/errors.h"
#include "tarnctl/model/limits.h"
#include "tarnctl/store/snapshot.h"

namespace TarnCtl::Api {

using HostCtl::Network::DVPortParam;

namespace {

class OpaqueState : public DVSwitchState {
 public:
  OpaqueState(std::shared_ptr<Session> session, std::string name, std::string portset)
      : DVSwitchState(std::move(session)), name_(std::move(name)), portset_(std::move(portset)) {}

  const Store::Opaque::Row& Row() {
    return row_.Get(db(), [this] {
      auto row = Store::Opaque::Find(db(), name_);
      if (!row) {
        throw Instrument::Refused("Opaque switch " + name_ + " does not exist", "on this host");
      }
      return *std::move(row);
    });
  }
  void EnsureStillExists() { Row(); }
  [[noreturn]] void RefuseChange() {
    EnsureStillExists();
    throw Instrument::Refused("Opaque switch " + name_ + " cannot be changed",
                              "(it belongs to another control plane)");
  }

  Instrument::Target CallTarget() const override { return Instrument::On(name_, portset_); }
  std::string Name() override { return portset_; }
  uint32_t NumPorts() override { return Row().numPorts; }
  uint32_t ConfiguredPorts() override { return Row().numPorts; }
  uint32_t UsedPorts() override { return Row().usedPorts; }
  std::vector<std::string> Uplinks() override { return Row().uplinks; }
  std::string EnsName(bool change) override {
    if (change) RefuseChange();
    EnsureStillExists();
    return portset_;
  }

  void AddDVPortUplink(const std::string&, const DVPortParam&) override { RefuseChange(); }
  void RemoveDVPortUplink(const std::string&) override { RefuseChange(); }
  std::vector<DVPortParam> DVPorts() override {
    EnsureStillExists();
    return {};
  }
  std::string SwitchId() override {
    EnsureStillExists();
    return "";
  }
  std::string SwitchName() override { return name_; }
  uint32_t Mtu() override {
    EnsureStillExists();
    return Model::kDefaultMtu;
  }
  void SetMtu(uint16_t) override { RefuseChange(); }

 private:
  std::string name_;
  std::string portset_;
  Store::Snapshot<Store::Opaque::Row> row_;
};

}  // namespace

std::unique_ptr<HostCtl::Network::DVSwitch> MakeOpaqueSwitch(std::shared_ptr<Session> session,
                                                             const std::string& name,
                                                             const std::string& portset) {
  return std::make_unique<DVSwitchImpl>(
      std::make_unique<OpaqueState>(std::move(session), name, portset));
}

}  // namespace TarnCtl::Api
