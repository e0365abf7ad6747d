// The ranges the host accepts, each with its one refusal: a value outside
// is refused (instrument/errors.h) with the range's text and, after it,
// "(min-max)" or the range's own explanation.
#pragma once

#include <cstdint>
#include <limits>
#include <string>

#include "tarnctl/store/default_host.h"

namespace TarnCtl::Model {

struct Range {
  const char* refusal;  // "{}" stands for the value
  int64_t min;
  int64_t max;
  const char* where = nullptr;  // nullptr: "(min-max)"; "": nothing
};

inline constexpr int64_t kInt32Max = std::numeric_limits<int32_t>::max();

// Ports of a standard or distributed switch (and of an opaque one).
inline constexpr Range kPorts{"Invalid number of ports {}", 8, 4096};
// MTU of any switch.
inline constexpr Range kMtu{"MTU {} is out of range", 1280, 9000};
// VLAN id of a port group (0: none).
inline constexpr Range kVlanId{"VLAN id {} is out of range", 0, 4095};
// CDP status: 0 down, 1 listen, 2 advertise, 3 both (kCdpWords in words.h).
inline constexpr Range kCdpStatus{"Invalid CDP status {}", 0, 3};
// Active uplinks of a teaming policy.
inline constexpr Range kMaxActive{"Invalid max active uplinks {}", 0, kInt32Max,
                                  "(it must be 0 or more)"};
// Version of a distributed switch.
inline constexpr Range kDvsVersion{"Invalid DVS version {}", 0, kInt32Max, ""};
// Uplink and LAG timeouts.
inline constexpr Range kTimeout{"Invalid timeout {}", 0, 255};
// Armed faults: calls to let pass first, calls to fail.
inline constexpr Range kFaultSkip{"Invalid skip count {}", 0, kInt32Max, "(it must be 0 or more)"};
inline constexpr Range kFaultTimes{"Invalid times {}", 1, kInt32Max, "(it must be 1 or more)"};
// A fault's calls still to fail once armed (0: spent), its delay in
// milliseconds and the calls it fired on.
inline constexpr Range kFaultTimesLeft{"Invalid times {}", 0, kInt32Max, "(it must be 0 or more)"};
inline constexpr Range kFaultDelay{"Invalid delay {} ms", 0, kInt32Max, "(it must be 0 or more)"};
inline constexpr Range kFaultFired{"Invalid fired count {}", 0, kInt32Max,
                                   "(it must be 0 or more)"};
// Values of the ordering counter (and so of every seq), with room to grow.
inline constexpr Range kSeq{"Invalid sequence number {}", 1, int64_t{1} << 53};

// What a new switch starts with.
inline constexpr int32_t kDefaultPorts = Store::kDefaultPorts;
inline constexpr uint32_t kDefaultMtu = Store::kDefaultMtu;
inline constexpr int32_t kDefaultCdpStatus = Store::kDefaultCdpStatus;

bool Within(const Range& range, int64_t value);
// Refuses a value outside `range`.
void Check(const Range& range, int64_t value);
// The same within [range.min, max] (a range whose end depends on another
// value, e.g. the used ports of an opaque switch).
void Check(const Range& range, int64_t value, int64_t max);

// "Invalid number of used ports {}", 0 to the switch's ports.
inline constexpr Range kUsedPorts{"Invalid number of used ports {}", 0, 4096};

}  // namespace TarnCtl::Model
