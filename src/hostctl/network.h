// The host control interface: the network objects that the tool reads and
// changes. Implemented by the host control library (src/tarnctl).
//
// Contracts shared by every operation below:
//  - Failure is reported only by throwing HostCtl::Lib::HostCtlException.
//  - Objects come back as owning pointers (several as a vector of owning
//    pointers, in the library's order); the caller releases them.
//  - Records travel by value.
#pragma once

#include <cstdint>
#include <map>
#include <memory>
#include <string>
#include <vector>

#include "hostctl/exception.h"
#include "hostctl/records.h"

namespace HostCtl::Network {

// One port of a port group. Only counted by the tool.
class Port {
 public:
  virtual ~Port() = default;
};

// Kernel side of a switch: standard, distributed and opaque switches are
// all portsets.
class Portset {
 public:
  // Ports of a new switch when none are asked for.
  static const int32_t DEF_NUM_PORTS;
  // A switch name must be shorter than this.
  static const uint32_t MAX_VSNAME_SZ;

  virtual ~Portset() = default;
  virtual std::string GetName() = 0;
  virtual uint32_t GetNumPorts() = 0;
  virtual uint32_t GetConfiguredPorts() = 0;
  virtual uint32_t GetUsedPorts() = 0;
  // Names of the physical NICs linked to the portset.
  virtual std::vector<std::string> GetUplinks() = 0;
  virtual bool GetEnsMode() = 0;
  virtual void ActivateEns(bool intr, bool fastSwitch) = 0;
  virtual void DeactivateEns() = 0;
  virtual void ReassociateEnsUplinks(bool mode, bool force, int reserved1, int reserved2) = 0;
};

// Shared base part of port groups: a named holder of ports.
class PortHolder {
 public:
  virtual ~PortHolder() = default;
  virtual std::string GetName() = 0;
  virtual std::vector<std::unique_ptr<Port>> GetPorts() = 0;
};

class PortGroup : public virtual PortHolder {
 public:
  ~PortGroup() override = default;
  virtual uint16_t GetVlanId() = 0;
  virtual void SetVlanId(uint16_t vlanId) = 0;
  virtual NicTeamingPolicy GetTeamingPolicy() = 0;
};

// Shared base part of distributed ports: use and key of the port.
class DVPortState {
 public:
  virtual ~DVPortState() = default;
  // True when the port is in use; `clients` receives its clients' names.
  virtual bool IsInUse(std::vector<std::string>& clients) = 0;
  virtual const DVPortParam& GetParam() const = 0;
};

class DVPort : public virtual DVPortState {
 public:
  ~DVPort() override = default;
  virtual std::string GetPortId() = 0;
};

class VirtualSwitch : public virtual Portset {
 public:
  ~VirtualSwitch() override = default;
  // Port groups in the order they were added.
  virtual std::vector<std::unique_ptr<PortGroup>> GetPortGroups() = 0;
  virtual std::unique_ptr<PortGroup> AddPortGroup(const std::string& name) = 0;
  virtual void RemovePortGroup(const std::string& name) = 0;
  virtual NicTeamingPolicy GetTeamingPolicy() = 0;
  virtual void SetTeamingPolicy(NicTeamingPolicy policy) = 0;
  virtual void AddUplink(const std::string& pnic, bool flag) = 0;
  // With `configOnly` the link is removed from the stored configuration only.
  virtual void RemoveUplink(const std::string& pnic, bool configOnly) = 0;
  virtual int32_t GetCdpStatus() = 0;
  virtual void SetCdpStatus(int32_t status) = 0;
  virtual uint32_t GetMTU() = 0;
  virtual void SetMTU(uint16_t mtu) = 0;
  // Links the uplinks of the stored configuration again.
  virtual void RestoreUplinks() = 0;
};

// A distributed switch; opaque switches answer through this interface too.
class DVSwitch : public virtual Portset {
 public:
  ~DVSwitch() override = default;
  virtual void AddDVPortUplink(const std::string& uplink, DVPortParam port) = 0;
  virtual void RemoveDVPortUplink(const std::string& uplink, int reserved) = 0;
  virtual std::vector<std::unique_ptr<DVPort>> GetDVPorts() = 0;
  virtual std::string GetDVSwitchId() = 0;
  virtual std::string GetSwitchName() = 0;
  virtual uint32_t GetMTU() = 0;
  virtual void SetMTU(uint16_t mtu) = 0;
  virtual std::map<std::string, DVPortParam> GetDVPortParams() = 0;
};

// Shared base part of the switch information object.
class Refreshable {
 public:
  virtual ~Refreshable() = default;
  virtual void Refresh() = 0;
};

// Host-wide switch operations.
class VirtualSwitchInfo : public virtual Refreshable {
 public:
  ~VirtualSwitchInfo() override = default;
  virtual std::unique_ptr<VirtualSwitch> AddVirtualSwitch(const NicTeamingPolicy& teaming,
                                                          const PortSecurityPolicy& security,
                                                          const ShapingPolicy& shaping,
                                                          const NicCapabilities& capabilities,
                                                          const std::string& name,
                                                          int32_t numPorts) = 0;
  virtual std::unique_ptr<DVSwitch> AddDVSwitch(const std::string& uuid,
                                                const std::string& switchName,
                                                const std::string& implClass,
                                                const std::string& portsetName, int32_t numPorts,
                                                int32_t version, int reserved) = 0;
  virtual void RemoveVirtualSwitch(const std::string& name) = 0;
  // `system` true: the system switches; false: all others.
  virtual std::vector<std::unique_ptr<VirtualSwitch>> GetVirtualSwitches(bool system) = 0;
  virtual std::vector<std::unique_ptr<DVSwitch>> GetDVSwitches() = 0;
  virtual std::vector<std::unique_ptr<DVSwitch>> GetOpaqueSwitches() = 0;
  // True when a standard switch of that name exists.
  virtual bool SwitchExists(const std::string& name) = 0;
  virtual void RestoreDVSwitches(const std::string& cacheFile) = 0;
  virtual void RestoreVirtualSwitches() = 0;
  virtual void LoadUplinkTimeoutConfig(const std::string& portset, uint32_t lagId,
                                       const std::string& uplink) = 0;
  virtual std::vector<UplinkTimeoutConfig> GetUplinkTimeoutConfig(const std::string& portset,
                                                                  uint32_t lagId,
                                                                  const std::string& uplink) = 0;
  virtual void LoadLagTimeoutConfig(const std::string& portset, uint32_t lagId) = 0;
  virtual std::vector<LagTimeoutConfig> GetLagTimeoutConfig(const std::string& portset,
                                                            uint32_t lagId) = 0;
};

// Static lookups. Each throws HostCtlException when no such object exists
// and never returns an empty pointer.
class NetworkFactory {
 public:
  static std::unique_ptr<VirtualSwitch> GetVirtualSwitchById(const std::string& name,
                                                             PortsetGetType type);
  static std::unique_ptr<Portset> GetPortsetById(const std::string& name);
  static std::unique_ptr<DVSwitch> GetDVSwitchByName(const std::string& name);
};

}  // namespace HostCtl::Network
