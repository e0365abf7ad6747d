// The host control library's own classes that the tool constructs or
// calls directly. Their state lives behind `State`, which only the library
// (src/tarnctl) defines.
//
// Sessions: while a NetworkInfoImpl exists, the process holds the host's
// exclusive lock, and every other object of the library made in the same
// process (a second NetworkInfoImpl, a VirtualSwitchInfoImpl, a
// PortGroupImpl, a DVPortImpl, the static lookups) shares that session
// instead of waiting for it. Made without one, they take the lock for their
// own lifetime (a static call: for the call).
#pragma once

#include <cstdint>
#include <memory>
#include <set>
#include <string>
#include <vector>

#include "hostctl/network.h"
#include "hostctl/nodi.h"

namespace TarnCtl::Network {

class NetworkInfoImpl {
 public:
  // Path of the distributed switch cache handed to RestoreDVSwitches.
  static const std::string DefaultDVSCacheFile;

  // Opens the host and takes its lock; throws HostCtlException on failure.
  NetworkInfoImpl();
  ~NetworkInfoImpl();
  NetworkInfoImpl(const NetworkInfoImpl&) = delete;
  NetworkInfoImpl& operator=(const NetworkInfoImpl&) = delete;

  std::unique_ptr<HostCtl::Network::VirtualSwitchInfo> GetVirtualSwitchInfo();
  // Names of all port groups of the host.
  std::set<std::string> GetAllPortGroupNames(HostCtl::Network::PortsetGetType type);

  struct State;

 private:
  std::unique_ptr<State> state_;
};

class VirtualSwitchInfoImpl : public HostCtl::Network::VirtualSwitchInfo {
 public:
  VirtualSwitchInfoImpl();
  struct State;
  explicit VirtualSwitchInfoImpl(std::unique_ptr<State> state);
  ~VirtualSwitchInfoImpl() override;

  void Refresh() override;
  std::unique_ptr<HostCtl::Network::VirtualSwitch> AddVirtualSwitch(
      const HostCtl::Network::NicTeamingPolicy& teaming,
      const HostCtl::Network::PortSecurityPolicy& security,
      const HostCtl::Network::ShapingPolicy& shaping,
      const HostCtl::Network::NicCapabilities& capabilities, const std::string& name,
      int32_t numPorts) override;
  std::unique_ptr<HostCtl::Network::DVSwitch> AddDVSwitch(
      const std::string& uuid, const std::string& switchName, const std::string& implClass,
      const std::string& portsetName, int32_t numPorts, int32_t version, int reserved) override;
  void RemoveVirtualSwitch(const std::string& name) override;
  std::vector<std::unique_ptr<HostCtl::Network::VirtualSwitch>> GetVirtualSwitches(
      bool system) override;
  std::vector<std::unique_ptr<HostCtl::Network::DVSwitch>> GetDVSwitches() override;
  std::vector<std::unique_ptr<HostCtl::Network::DVSwitch>> GetOpaqueSwitches() override;
  bool SwitchExists(const std::string& name) override;
  void RestoreDVSwitches(const std::string& cacheFile) override;
  void RestoreVirtualSwitches() override;
  void LoadUplinkTimeoutConfig(const std::string& portset, uint32_t lagId,
                               const std::string& uplink) override;
  std::vector<HostCtl::Network::UplinkTimeoutConfig> GetUplinkTimeoutConfig(
      const std::string& portset, uint32_t lagId, const std::string& uplink) override;
  void LoadLagTimeoutConfig(const std::string& portset, uint32_t lagId) override;
  std::vector<HostCtl::Network::LagTimeoutConfig> GetLagTimeoutConfig(const std::string& portset,
                                                                      uint32_t lagId) override;

 private:
  std::unique_ptr<State> state_;
};

// A portset as the library hands it out. Standard, distributed and opaque
// switch objects of the library derive from it.
class PortsetImpl : public virtual HostCtl::Network::Portset {
 public:
  // True when `name` names a standard or distributed switch of the host.
  static bool IsValidVirtualSwitch(const std::string& name);

  struct State;
  explicit PortsetImpl(std::unique_ptr<State> state);
  ~PortsetImpl() override;

  std::string GetName() override;
  uint32_t GetNumPorts() override;
  uint32_t GetConfiguredPorts() override;
  uint32_t GetUsedPorts() override;
  std::vector<std::string> GetUplinks() override;
  bool GetEnsMode() override;
  void ActivateEns(bool intr, bool fastSwitch) override;
  void DeactivateEns() override;
  void ReassociateEnsUplinks(bool mode, bool force, int reserved1, int reserved2) override;

 protected:
  std::unique_ptr<State> state_;
};

class VirtualSwitchImpl : public HostCtl::Network::VirtualSwitch, public PortsetImpl {
 public:
  // "down", "listen", "advertise" or "both" to 0..3; refuses other words.
  static int32_t ParseCdpStatus(const std::string& word);

  explicit VirtualSwitchImpl(std::unique_ptr<PortsetImpl::State> state);
  ~VirtualSwitchImpl() override;

  std::vector<std::unique_ptr<HostCtl::Network::PortGroup>> GetPortGroups() override;
  std::unique_ptr<HostCtl::Network::PortGroup> AddPortGroup(const std::string& name) override;
  void RemovePortGroup(const std::string& name) override;
  HostCtl::Network::NicTeamingPolicy GetTeamingPolicy() override;
  void SetTeamingPolicy(HostCtl::Network::NicTeamingPolicy policy) override;
  void AddUplink(const std::string& pnic, bool flag) override;
  void RemoveUplink(const std::string& pnic, bool configOnly) override;
  int32_t GetCdpStatus() override;
  void SetCdpStatus(int32_t status) override;
  uint32_t GetMTU() override;
  void SetMTU(uint16_t mtu) override;
  void RestoreUplinks() override;
};

class PortGroupImpl : public HostCtl::Network::PortGroup {
 public:
  // True when a port group of that name exists on the host.
  static bool IsValidPortGroup(const std::string& name);

  // Throws HostCtlException when no port group of that name exists.
  explicit PortGroupImpl(const std::string& name);
  struct State;
  explicit PortGroupImpl(std::unique_ptr<State> state);
  ~PortGroupImpl() override;

  std::string GetName() override;
  std::vector<std::unique_ptr<HostCtl::Network::Port>> GetPorts() override;
  uint16_t GetVlanId() override;
  void SetVlanId(uint16_t vlanId) override;
  HostCtl::Network::NicTeamingPolicy GetTeamingPolicy() override;
  void SetTeamingPolicy(HostCtl::Network::NicTeamingPolicy policy);

 private:
  std::unique_ptr<State> state_;
};

class DVPortImpl : public HostCtl::Network::DVPort {
 public:
  // Does not throw for an unknown port: ask IsValid.
  explicit DVPortImpl(const HostCtl::Network::DVPortParam& param);
  struct State;
  explicit DVPortImpl(std::unique_ptr<State> state);
  ~DVPortImpl() override;

  // False when the key's switch id and port id name no distributed port.
  bool IsValid();
  uint32_t GetConnectionId() const;
  void SetConnectionId(uint32_t connectionId);
  // Raises a test observation event for the port.
  int TestDVPortNota();

  std::string GetPortId() override;
  bool IsInUse(std::vector<std::string>& clients) override;
  const HostCtl::Network::DVPortParam& GetParam() const override;

 private:
  std::unique_ptr<State> state_;
};

}  // namespace TarnCtl::Network

namespace TarnCtl::Util {

class SysinfoUtil {
 public:
  // A new parameter list holding `value`, or nullptr when none can be made.
  static NODI_ParamList* GetIntParamList(uint32_t value, NODI_ParamListType type);
};

}  // namespace TarnCtl::Util
