// Value records that cross the host control interface.
//
// All records are values: copies own their strings and lists. The member
// functions declared here belong to the host control library (they may
// throw HostCtlException); the tool only reads and copies the fields.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

namespace HostCtl::Network {

// Selects which portsets a lookup considers. The tool only ever passes 0.
enum PortsetGetType : int {
  PORTSET_GET_DEFAULT = 0,
  PORTSET_GET_ALL = 1,
};

// Link failure detection criteria of a teaming policy. Carried and copied,
// never interpreted by the tool.
class LinkCriteriaSelectionPolicy {
 public:
  virtual ~LinkCriteriaSelectionPolicy() = default;

  uint64_t checkMask = 0;
  uint64_t minSpeed = 0;
  uint32_t errorPercent = 0;
  uint8_t fullDuplex = 0;
};

// Teaming policy of a standard switch or a port group.
class NicTeamingPolicy {
 public:
  // Set in `flags` when `uplinkOrder` carries an order of its own.
  static constexpr uint64_t kUplinkOrderSet = 0x10;

  virtual ~NicTeamingPolicy() = default;

  // The policy every new standard switch starts with: an explicit, empty
  // uplink order and no active uplinks.
  static NicTeamingPolicy GetDefaultPolicy();

  // Replaces the active count. Refuses a negative count.
  void SetMaxActiveUplinks(int count);
  // Replaces the uplink order and marks it as set (kUplinkOrderSet).
  void SetUplinkOrder(std::vector<std::string> order);

  uint64_t flags = 0;
  uint16_t balancing = 0;
  uint8_t failback = 0;
  LinkCriteriaSelectionPolicy linkCriteria;
  // Failover order: the first `maxActive` entries are the active uplinks.
  std::vector<std::string> uplinkOrder;
  int32_t maxActive = 0;
};

// Capabilities of the NICs of a new switch; a plain record.
struct NicCapabilities {
  uint32_t offloadBits = 0;
  uint32_t reserved = 0;

  static NicCapabilities GetDefaultPolicy();
};

// Traffic shaping of a new switch.
struct ShapingPolicy {
  bool enabled = false;
  uint64_t averageBandwidth = 0;
  uint64_t peakBandwidth = 0;
  uint64_t burstSize = 0;

  static ShapingPolicy GetDefaultPolicy();
};

// Port security of a new switch.
struct PortSecurityPolicy {
  bool allowPromiscuous = false;
  bool allowMacChanges = false;
  bool allowForgedTransmits = false;

  static PortSecurityPolicy GetDefaultPolicy();
};

// Key of one distributed port. A connection id of 0 means "none yet".
struct DVPortParam {
  std::string switchId;
  std::string portId;
  uint32_t connectionId = 0;
};

struct UplinkTimeoutConfig {
  std::string portsetName;
  std::string uplinkName;
  uint32_t lagId = 0;
  uint8_t timeout = 0;
};

struct LagTimeoutConfig {
  std::string portsetName;
  uint32_t lagId = 0;
  uint8_t timeout = 0;
};

}  // namespace HostCtl::Network
