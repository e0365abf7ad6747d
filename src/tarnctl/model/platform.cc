// Platform constants of the simulated host that its rules depend on.
#include "hostctl/network.h"
#include "hostctl/nodi.h"

namespace HostCtl::Network {
const int32_t Portset::DEF_NUM_PORTS = 128;
const uint32_t Portset::MAX_VSNAME_SZ = 32;
}  // namespace HostCtl::Network

const NODI_NodeId NODI_NODE_net_ens_activate = 0x2a1;
