#include "tarnctl/store/schema.h"

namespace TarnCtl::Store {

// Every open parses this text, so it is as short as the host allows: keys
// and the indexes that keep a lookup from reading a whole table that grows
// with the host (the rows of one switch); small sets are sorted instead.
// Values are checked by the model and bound with their types by the store,
// so columns carry no declared type or constraint of their own. Layered
// tables put `layer` after the name in their keys: a change goes to both
// layers, whose rows then share a page.
const char* const kSchemaSql = R"sql(
CREATE TABLE meta(key PRIMARY KEY, value) WITHOUT ROWID;
CREATE TABLE pnic(seq INTEGER PRIMARY KEY, name UNIQUE);
CREATE TABLE vswitch(layer, name, seq, num_ports, mtu, cdp, system, policy,
  PRIMARY KEY(name, layer)) WITHOUT ROWID;
CREATE TABLE portgroup(layer, name, switch, seq, vlan, policy, PRIMARY KEY(name, layer))
  WITHOUT ROWID;
CREATE INDEX portgroup_switch ON portgroup(switch, layer, seq, vlan, policy);
CREATE TABLE link(layer, pnic, switch, seq, PRIMARY KEY(pnic, layer)) WITHOUT ROWID;
CREATE INDEX link_switch ON link(switch, layer, seq);
CREATE TABLE client(portgroup, name, seq, PRIMARY KEY(portgroup, name)) WITHOUT ROWID;
CREATE TABLE dvswitch(layer, name, portset, switch_id, uuid, impl_class, version, num_ports,
  mtu, seq, PRIMARY KEY(name, layer), UNIQUE(layer, portset), UNIQUE(layer, switch_id))
  WITHOUT ROWID;
CREATE TABLE dvs_uplink(layer, pnic, dvs, port_id, seq, PRIMARY KEY(pnic, layer))
  WITHOUT ROWID;
CREATE INDEX dvs_uplink_dvs ON dvs_uplink(dvs, layer, seq);
CREATE TABLE dvport(dvs, port_id, connection_id, seq, PRIMARY KEY(dvs, port_id)) WITHOUT ROWID;
CREATE TABLE dvport_client(dvs, port_id, name, seq, PRIMARY KEY(dvs, port_id, name))
  WITHOUT ROWID;
CREATE TABLE dvport_event(seq INTEGER PRIMARY KEY, dvs, port_id, kind);
CREATE TABLE opaque(name PRIMARY KEY, portset UNIQUE, num_ports, used_ports, uplinks, seq);
CREATE TABLE ens(portset PRIMARY KEY, intr, fast_switch) WITHOUT ROWID;
CREATE TABLE ens_event(seq INTEGER PRIMARY KEY, portset, mode, force);
CREATE TABLE uplink_timeout(layer, portset, uplink, lag_id, timeout,
  PRIMARY KEY(layer, portset, uplink, lag_id)) WITHOUT ROWID;
CREATE TABLE lag_timeout(layer, portset, lag_id, timeout, PRIMARY KEY(layer, portset, lag_id))
  WITHOUT ROWID;
CREATE TABLE fault(id INTEGER PRIMARY KEY, operation, target, message, detail, skip, times,
  delay_ms, pass, always, fired);
)sql";

// Version 1 had no delays, flags or counts of its faults.
const char* const kFaultColumnsSince2 = R"sql(
ALTER TABLE fault ADD COLUMN delay_ms DEFAULT 0;
ALTER TABLE fault ADD COLUMN pass DEFAULT 0;
ALTER TABLE fault ADD COLUMN always DEFAULT 0;
ALTER TABLE fault ADD COLUMN fired DEFAULT 0;
)sql";

const char* const kFaultViewOfVersion1 = R"sql(
CREATE TEMP VIEW fault AS SELECT id, operation, target, message, detail, skip, times,
  0 AS delay_ms, 0 AS pass, 0 AS always, 0 AS fired FROM main.fault;
)sql";

}  // namespace TarnCtl::Store
