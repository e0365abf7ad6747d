// Restore after a reboot: stored standard switches and port groups, and the
// cached distributed switches with their uplinks, back into the running
// state. Objects that are running already, or whose names or pnics are taken
// by running ones, are left as they are.
#include "hostctl/tarnctl.h"
#include "tarnctl/call.h"
#include "tarnctl/errors.h"
#include "tarnctl/info_state.h"

namespace TarnCtl::Network {

using Detail::Call;
using Detail::FormatArgs;
using Detail::Session;
using Detail::Transaction;

void VirtualSwitchInfoImpl::RestoreVirtualSwitches() {
  Session& session = *state_->session;
  Call call(&session, "RestoreVirtualSwitches", Detail::Nothing(), "");
  Transaction transaction(session);
  session.Exec(R"sql(
    INSERT INTO vswitch(layer, name, seq, num_ports, mtu, cdp, system, policy)
      SELECT 1, name, seq, num_ports, mtu, cdp, system, policy FROM vswitch s
      WHERE s.layer = 0
        AND NOT EXISTS (SELECT 1 FROM vswitch r WHERE r.layer = 1 AND r.name = s.name)
        AND NOT EXISTS (SELECT 1 FROM dvswitch d
                        WHERE d.layer = 1 AND (d.name = s.name OR d.portset = s.name))
        AND NOT EXISTS (SELECT 1 FROM opaque o WHERE o.name = s.name OR o.portset = s.name);
    INSERT INTO portgroup(layer, name, switch, seq, vlan, policy)
      SELECT 1, name, switch, seq, vlan, policy FROM portgroup s
      WHERE s.layer = 0
        AND NOT EXISTS (SELECT 1 FROM portgroup r WHERE r.layer = 1 AND r.name = s.name)
        AND EXISTS (SELECT 1 FROM vswitch r WHERE r.layer = 1 AND r.name = s.switch);
  )sql");
  transaction.Commit();
}

void VirtualSwitchInfoImpl::RestoreDVSwitches(const std::string& cacheFile) {
  Session& session = *state_->session;
  Call call(&session, "RestoreDVSwitches", Detail::Named(cacheFile), FormatArgs(cacheFile));
  if (cacheFile != NetworkInfoImpl::DefaultDVSCacheFile) {
    throw Detail::Refused("Cannot open distributed switch cache " + cacheFile,
                          "(the cache is " + NetworkInfoImpl::DefaultDVSCacheFile + ")");
  }
  Transaction transaction(session);
  session.Exec(R"sql(
    INSERT INTO dvswitch(layer, name, portset, switch_id, uuid, impl_class, version, num_ports,
                         mtu, seq)
      SELECT 1, name, portset, switch_id, uuid, impl_class, version, num_ports, mtu, seq
      FROM dvswitch s
      WHERE s.layer = 0
        AND NOT EXISTS (SELECT 1 FROM dvswitch r
                        WHERE r.layer = 1 AND (r.name IN (s.name, s.portset)
                                               OR r.portset IN (s.name, s.portset)
                                               OR r.switch_id = s.switch_id))
        AND NOT EXISTS (SELECT 1 FROM vswitch v
                        WHERE v.layer = 1 AND v.name IN (s.name, s.portset))
        AND NOT EXISTS (SELECT 1 FROM opaque o
                        WHERE o.name IN (s.name, s.portset) OR o.portset IN (s.name, s.portset));
    INSERT INTO dvs_uplink(layer, pnic, dvs, port_id, seq)
      SELECT 1, pnic, dvs, port_id, seq FROM dvs_uplink s
      WHERE s.layer = 0
        AND EXISTS (SELECT 1 FROM dvswitch d WHERE d.layer = 1 AND d.name = s.dvs)
        AND NOT EXISTS (SELECT 1 FROM dvs_uplink r WHERE r.layer = 1 AND r.pnic = s.pnic)
        AND NOT EXISTS (SELECT 1 FROM link l WHERE l.layer = 1 AND l.pnic = s.pnic)
        AND NOT EXISTS (SELECT 1 FROM opaque o, json_each(o.uplinks) u WHERE u.value = s.pnic);
  )sql");
  transaction.Commit();
}

}  // namespace TarnCtl::Network
