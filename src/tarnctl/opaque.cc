// Opaque switches: switches of another control plane that this host only
// shows. They answer the portset and DVSwitch reads (MTU 1500, no DVPorts,
// an empty switch id, configured ports = ports) and refuse every change.
#include "tarnctl/call.h"
#include "tarnctl/dvswitch.h"
#include "tarnctl/errors.h"
#include "tarnctl/limits.h"
#include "tarnctl/policy_codec.h"
#include "tarnctl/portset_state.h"
#include "tarnctl/snapshot.h"
#include "tarnctl/switches.h"

namespace TarnCtl::Detail {

using HostCtl::Network::DVPortParam;

namespace {

struct OpaqueRow {
  uint32_t numPorts = 0;
  uint32_t usedPorts = 0;
  std::vector<std::string> uplinks;
};

class OpaqueState : public Network::PortsetImpl::State {
 public:
  OpaqueState(std::shared_ptr<Session> session, std::string name, std::string portset)
      : State(std::move(session)), name_(std::move(name)), portset_(std::move(portset)) {}

  const std::string& name() const { return name_; }
  const OpaqueRow& Row() {
    return row_.Get(*session, [this] {
      auto select =
          session->Prepare("SELECT num_ports, used_ports, uplinks FROM opaque WHERE name = ?");
      if (!select.Bind(1, name_).Step()) {
        throw Refused("Opaque switch " + name_ + " does not exist", "on this host");
      }
      return OpaqueRow{static_cast<uint32_t>(select.Int(0)), static_cast<uint32_t>(select.Int(1)),
                       DecodeNameList(select.Text(2))};
    });
  }
  [[noreturn]] void RefuseChange() {
    throw Refused("Opaque switch " + name_ + " cannot be changed",
                  "(it belongs to another control plane)");
  }

  Target CallTarget() const override { return On(name_, portset_); }
  std::string Name() override { return portset_; }
  uint32_t NumPorts() override { return Row().numPorts; }
  uint32_t ConfiguredPorts() override { return Row().numPorts; }
  uint32_t UsedPorts() override { return Row().usedPorts; }
  std::vector<std::string> Uplinks() override { return Row().uplinks; }
  std::string EnsName(bool change) override {
    Row();
    if (change) RefuseChange();
    return portset_;
  }

 private:
  std::string name_;
  std::string portset_;
  Snapshot<OpaqueRow> row_;
};

OpaqueState& Opaque(Network::PortsetImpl::State& state) {
  return static_cast<OpaqueState&>(state);
}

}  // namespace

std::unique_ptr<HostCtl::Network::DVSwitch> FindOpaqueSwitch(std::shared_ptr<Session> session,
                                                             const std::string& name) {
  auto select = session->Prepare("SELECT portset FROM opaque WHERE name = ?");
  if (!select.Bind(1, name).Step()) return nullptr;
  return std::make_unique<OpaqueSwitchImpl>(
      std::make_unique<OpaqueState>(session, name, select.Text(0)));
}

std::unique_ptr<Network::PortsetImpl::State> MakeOpaqueState(std::shared_ptr<Session> session,
                                                             const std::string& name,
                                                             const std::string& portset) {
  return std::make_unique<OpaqueState>(std::move(session), name, portset);
}

OpaqueSwitchImpl::OpaqueSwitchImpl(std::unique_ptr<PortsetImpl::State> state)
    : PortsetImpl(std::move(state)) {}

OpaqueSwitchImpl::~OpaqueSwitchImpl() = default;

void OpaqueSwitchImpl::AddDVPortUplink(const std::string& uplink, DVPortParam port) {
  OpaqueState& sw = Opaque(*state_);
  Call call(sw.session.get(), "AddDVPortUplink", sw.CallTarget(), FormatArgs(uplink, port));
  sw.Row();
  sw.RefuseChange();
}

void OpaqueSwitchImpl::RemoveDVPortUplink(const std::string& uplink, int reserved) {
  OpaqueState& sw = Opaque(*state_);
  Call call(sw.session.get(), "RemoveDVPortUplink", sw.CallTarget(), FormatArgs(uplink, reserved));
  sw.Row();
  sw.RefuseChange();
}

std::vector<std::unique_ptr<HostCtl::Network::DVPort>> OpaqueSwitchImpl::GetDVPorts() {
  OpaqueState& sw = Opaque(*state_);
  Call call(sw.session.get(), "GetDVPorts", sw.CallTarget(), "");
  sw.Row();
  return {};
}

std::string OpaqueSwitchImpl::GetDVSwitchId() {
  OpaqueState& sw = Opaque(*state_);
  Call call(sw.session.get(), "GetDVSwitchId", sw.CallTarget(), "");
  sw.Row();
  return "";
}

std::string OpaqueSwitchImpl::GetSwitchName() {
  OpaqueState& sw = Opaque(*state_);
  Call call(sw.session.get(), "GetSwitchName", sw.CallTarget(), "");
  return sw.name();
}

uint32_t OpaqueSwitchImpl::GetMTU() {
  OpaqueState& sw = Opaque(*state_);
  Call call(sw.session.get(), "GetMTU", sw.CallTarget(), "");
  sw.Row();
  return kDefaultMtu;
}

void OpaqueSwitchImpl::SetMTU(uint16_t mtu) {
  OpaqueState& sw = Opaque(*state_);
  Call call(sw.session.get(), "SetMTU", sw.CallTarget(), FormatArgs(mtu));
  sw.Row();
  sw.RefuseChange();
}

std::map<std::string, DVPortParam> OpaqueSwitchImpl::GetDVPortParams() {
  OpaqueState& sw = Opaque(*state_);
  Call call(sw.session.get(), "GetDVPortParams", sw.CallTarget(), "");
  sw.Row();
  return {};
}

}  // namespace TarnCtl::Detail
