#include "tarnctl/store/default_host.h"

#include "hostctl/records.h"
#include "tarnctl/store/policy_codec.h"

namespace TarnCtl::Store {

std::string HostSql(bool objects) {
  const std::string empty = "INSERT INTO meta(key, value) VALUES ('ens_node', '0');\n";
  if (!objects) return empty + "INSERT INTO meta(key, value) VALUES ('next_seq', '1');\n";
  HostCtl::Network::NicTeamingPolicy uplink;
  uplink.flags = HostCtl::Network::NicTeamingPolicy::kUplinkOrderSet;
  uplink.uplinkOrder = {"pnic0"};
  uplink.maxActive = 1;
  const auto quoted = [](const std::string& text) { return "'" + text + "'"; };
  const auto bothLayers = " FROM (SELECT 0 AS layer UNION ALL SELECT 1);\n";
  return empty +
         "INSERT INTO meta(key, value) VALUES ('next_seq', '8');\n"
         "INSERT INTO pnic(seq, name) VALUES (1, 'pnic0'), (2, 'pnic1'), (3, 'pnic2'), "
         "(4, 'pnic3');\n"
         "INSERT INTO vswitch(layer, name, seq, num_ports, mtu, cdp, system, policy)"
         " SELECT layer, 'vswitch0', 5, " +
         std::to_string(kDefaultPorts) + ", " + std::to_string(kDefaultMtu) + ", " +
         std::to_string(kDefaultCdpStatus) + ", 0, " + quoted(EncodeTeamingPolicy(uplink)) +
         bothLayers +
         "INSERT INTO link(layer, pnic, switch, seq) VALUES (0, 'pnic0', 'vswitch0', 6), "
         "(1, 'pnic0', 'vswitch0', 6);\n"
         "INSERT INTO portgroup(layer, name, switch, seq, vlan, policy)"
         " SELECT layer, 'Management', 'vswitch0', 7, 0, " +
         quoted(EncodeTeamingPolicy({})) + bothLayers;
}

}  // namespace TarnCtl::Store
