// The library's distributed switch objects. Two kinds of switch answer the
// distributed switch interface: distributed switches, which live in the
// running state and the distributed switch cache, and opaque switches,
// which another control plane owns and which refuse every change. One
// object class serves both; each kind's behaviour sits in its state.
#pragma once

#include <map>
#include <memory>
#include <string>
#include <vector>

#include "hostctl/tarnctl.h"
#include "tarnctl/api/portset_state.h"

namespace TarnCtl::Api {

class DVSwitchState : public Network::PortsetImpl::State {
 public:
  using State::State;

  virtual void AddDVPortUplink(const std::string& uplink,
                               const HostCtl::Network::DVPortParam& port) = 0;
  virtual void RemoveDVPortUplink(const std::string& uplink) = 0;
  // The switch's DVPorts, in the order they were made.
  virtual std::vector<HostCtl::Network::DVPortParam> DVPorts() = 0;
  virtual std::string SwitchId() = 0;
  virtual std::string SwitchName() = 0;
  virtual uint32_t Mtu() = 0;
  virtual void SetMtu(uint16_t mtu) = 0;
};

class DVSwitchImpl : public HostCtl::Network::DVSwitch, public Network::PortsetImpl {
 public:
  explicit DVSwitchImpl(std::unique_ptr<DVSwitchState> state);
  ~DVSwitchImpl() override;

  void AddDVPortUplink(const std::string& uplink, HostCtl::Network::DVPortParam port) override;
  void RemoveDVPortUplink(const std::string& uplink, int reserved) override;
  std::vector<std::unique_ptr<HostCtl::Network::DVPort>> GetDVPorts() override;
  std::string GetDVSwitchId() override;
  std::string GetSwitchName() override;
  uint32_t GetMTU() override;
  void SetMTU(uint16_t mtu) override;
  std::map<std::string, HostCtl::Network::DVPortParam> GetDVPortParams() override;

 private:
  DVSwitchState& Dvs() { return static_cast<DVSwitchState&>(*state_); }
};

}  // namespace TarnCtl::Api
