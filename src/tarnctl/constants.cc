// Platform constants of the simulated host.
#include "hostctl/nodi.h"
#include "hostctl/tarnctl.h"

namespace HostCtl::Network {
const int32_t Portset::DEF_NUM_PORTS = 128;
const uint32_t Portset::MAX_VSNAME_SZ = 32;
}  // namespace HostCtl::Network

namespace TarnCtl::Network {
const std::string NetworkInfoImpl::DefaultDVSCacheFile = "/etc/tarnhost/dvs-cache.db";
}

const NODI_NodeId NODI_NODE_net_ens_activate = 0x2a1;
