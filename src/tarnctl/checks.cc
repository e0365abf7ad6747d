#include "tarnctl/checks.h"

#include <string>

#include "tarnctl/errors.h"
#include "tarnctl/limits.h"

namespace TarnCtl::Detail {

void CheckMtu(uint32_t mtu) {
  if (mtu < kMinMtu || mtu > kMaxMtu) {
    throw Refused("MTU " + std::to_string(mtu) + " is out of range",
                  "(" + std::to_string(kMinMtu) + "-" + std::to_string(kMaxMtu) + ")");
  }
}

void CheckPorts(int32_t ports) {
  if (ports < kMinPorts || ports > kMaxPorts) {
    throw Refused("Invalid number of ports " + std::to_string(ports),
                  "(" + std::to_string(kMinPorts) + "-" + std::to_string(kMaxPorts) + ")");
  }
}

}  // namespace TarnCtl::Detail
