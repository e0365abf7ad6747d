// The library's distributed and opaque switch objects. Distributed switches
// live in the running state (layer 1) and the distributed switch cache
// (layer 0); opaque switches are read-only and refuse every change.
#pragma once

#include <map>
#include <memory>
#include <string>
#include <vector>

#include "hostctl/tarnctl.h"

namespace TarnCtl::Detail {

class DVSwitchImpl : public HostCtl::Network::DVSwitch, public Network::PortsetImpl {
 public:
  explicit DVSwitchImpl(std::unique_ptr<PortsetImpl::State> state);
  ~DVSwitchImpl() override;

  void AddDVPortUplink(const std::string& uplink, HostCtl::Network::DVPortParam port) override;
  void RemoveDVPortUplink(const std::string& uplink, int reserved) override;
  std::vector<std::unique_ptr<HostCtl::Network::DVPort>> GetDVPorts() override;
  std::string GetDVSwitchId() override;
  std::string GetSwitchName() override;
  uint32_t GetMTU() override;
  void SetMTU(uint16_t mtu) override;
  std::map<std::string, HostCtl::Network::DVPortParam> GetDVPortParams() override;
};

class OpaqueSwitchImpl : public HostCtl::Network::DVSwitch, public Network::PortsetImpl {
 public:
  explicit OpaqueSwitchImpl(std::unique_ptr<PortsetImpl::State> state);
  ~OpaqueSwitchImpl() override;

  void AddDVPortUplink(const std::string& uplink, HostCtl::Network::DVPortParam port) override;
  void RemoveDVPortUplink(const std::string& uplink, int reserved) override;
  std::vector<std::unique_ptr<HostCtl::Network::DVPort>> GetDVPorts() override;
  std::string GetDVSwitchId() override;
  std::string GetSwitchName() override;
  uint32_t GetMTU() override;
  void SetMTU(uint16_t mtu) override;
  std::map<std::string, HostCtl::Network::DVPortParam> GetDVPortParams() override;
};

}  // namespace TarnCtl::Detail
