// Range checks shared by the switch kinds (ranges in limits.h). Each
// refuses with a HostCtlException of the running operation.
#pragma once

#include <cstdint>

namespace TarnCtl::Detail {

void CheckMtu(uint32_t mtu);
void CheckPorts(int32_t ports);

}  // namespace TarnCtl::Detail
