#include "tarnctl/store/default_host.h"

namespace TarnCtl::Store {

#define TARN_EMPTY_HOST "INSERT INTO meta(key, value) VALUES ('ens_node', '0');\n"

const char* const kEmptyHostSql =
    TARN_EMPTY_HOST "INSERT INTO meta(key, value) VALUES ('next_seq', '1');\n";

// The policies are in the stored form of policy_codec.h.
const char* const kDefaultHostSql = TARN_EMPTY_HOST R"sql(
INSERT INTO meta(key, value) VALUES ('next_seq', '8');
INSERT INTO pnic(seq, name) VALUES (1, 'pnic0'), (2, 'pnic1'), (3, 'pnic2'), (4, 'pnic3');
INSERT INTO vswitch(layer, name, seq, num_ports, mtu, cdp, system, policy)
  SELECT layer, 'vswitch0', 5, 128, 1500, 1, 0,
    '{"flags":16,"uplinkOrder":["pnic0"],"maxActive":1}'
  FROM (SELECT 0 AS layer UNION ALL SELECT 1);
INSERT INTO link(layer, pnic, switch, seq) VALUES (0, 'pnic0', 'vswitch0', 6), (1, 'pnic0', 'vswitch0', 6);
INSERT INTO portgroup(layer, name, switch, seq, vlan, policy)
  SELECT layer, 'Management', 'vswitch0', 7, 0,
    '{}'
  FROM (SELECT 0 AS layer UNION ALL SELECT 1);
)sql";

#undef TARN_EMPTY_HOST

}  // namespace TarnCtl::Store
