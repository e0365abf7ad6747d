#include "tarnctl/store/schema.h"

namespace TarnCtl::Store {

// Ranges and names are the model's to check; the schema keeps keys and
// order. Layered tables put `layer` first in every key.
const char* const kSchemaSql = R"sql(
CREATE TABLE meta(key TEXT PRIMARY KEY, value TEXT NOT NULL) WITHOUT ROWID;
CREATE TABLE pnic(seq INTEGER PRIMARY KEY, name TEXT NOT NULL UNIQUE);
CREATE TABLE vswitch(layer INTEGER, name TEXT, seq INTEGER NOT NULL, num_ports INTEGER NOT NULL,
  mtu INTEGER NOT NULL, cdp INTEGER NOT NULL, system INTEGER NOT NULL DEFAULT 0,
  policy TEXT NOT NULL, PRIMARY KEY(layer, name)) WITHOUT ROWID;
CREATE INDEX vswitch_order ON vswitch(layer, system, seq);
CREATE TABLE portgroup(layer INTEGER, name TEXT, switch TEXT NOT NULL, seq INTEGER NOT NULL,
  vlan INTEGER NOT NULL DEFAULT 0, policy TEXT NOT NULL, PRIMARY KEY(layer, name)) WITHOUT ROWID;
CREATE INDEX portgroup_switch ON portgroup(layer, switch, seq);
CREATE TABLE link(layer INTEGER, pnic TEXT, switch TEXT NOT NULL, seq INTEGER NOT NULL,
  PRIMARY KEY(layer, pnic)) WITHOUT ROWID;
CREATE INDEX link_switch ON link(layer, switch, seq);
CREATE TABLE client(portgroup TEXT, name TEXT, seq INTEGER NOT NULL,
  PRIMARY KEY(portgroup, name)) WITHOUT ROWID;
CREATE INDEX client_order ON client(portgroup, seq);
CREATE TABLE dvswitch(layer INTEGER, name TEXT, portset TEXT NOT NULL, switch_id TEXT NOT NULL,
  uuid TEXT NOT NULL, impl_class TEXT NOT NULL, version INTEGER NOT NULL,
  num_ports INTEGER NOT NULL, mtu INTEGER NOT NULL, seq INTEGER NOT NULL,
  PRIMARY KEY(layer, name)) WITHOUT ROWID;
CREATE UNIQUE INDEX dvswitch_portset ON dvswitch(layer, portset);
CREATE UNIQUE INDEX dvswitch_id ON dvswitch(layer, switch_id);
CREATE INDEX dvswitch_order ON dvswitch(layer, seq);
CREATE TABLE dvs_uplink(layer INTEGER, pnic TEXT, dvs TEXT NOT NULL, port_id TEXT,
  seq INTEGER NOT NULL, PRIMARY KEY(layer, pnic)) WITHOUT ROWID;
CREATE INDEX dvs_uplink_dvs ON dvs_uplink(layer, dvs, seq);
CREATE TABLE dvport(dvs TEXT, port_id TEXT, connection_id INTEGER NOT NULL DEFAULT 0,
  seq INTEGER NOT NULL, PRIMARY KEY(dvs, port_id)) WITHOUT ROWID;
CREATE INDEX dvport_order ON dvport(dvs, seq);
CREATE TABLE dvport_client(dvs TEXT, port_id TEXT, name TEXT, seq INTEGER NOT NULL,
  PRIMARY KEY(dvs, port_id, name)) WITHOUT ROWID;
CREATE INDEX dvport_client_order ON dvport_client(dvs, port_id, seq);
CREATE TABLE dvport_event(seq INTEGER PRIMARY KEY, dvs TEXT NOT NULL, port_id TEXT NOT NULL,
  kind TEXT NOT NULL);
CREATE TABLE opaque(name TEXT PRIMARY KEY, portset TEXT NOT NULL UNIQUE,
  num_ports INTEGER NOT NULL, used_ports INTEGER NOT NULL, uplinks TEXT NOT NULL,
  seq INTEGER NOT NULL);
CREATE TABLE ens(portset TEXT PRIMARY KEY, intr INTEGER NOT NULL, fast_switch INTEGER NOT NULL)
  WITHOUT ROWID;
CREATE TABLE ens_event(seq INTEGER PRIMARY KEY, portset TEXT NOT NULL, mode INTEGER NOT NULL,
  force INTEGER NOT NULL);
CREATE TABLE uplink_timeout(layer INTEGER, portset TEXT, uplink TEXT, lag_id INTEGER,
  timeout INTEGER NOT NULL, PRIMARY KEY(layer, portset, uplink, lag_id)) WITHOUT ROWID;
CREATE TABLE lag_timeout(layer INTEGER, portset TEXT, lag_id INTEGER, timeout INTEGER NOT NULL,
  PRIMARY KEY(layer, portset, lag_id)) WITHOUT ROWID;
CREATE TABLE fault(id INTEGER PRIMARY KEY, operation TEXT NOT NULL, target TEXT,
  message TEXT NOT NULL, detail TEXT NOT NULL, skip INTEGER NOT NULL DEFAULT 0,
  times INTEGER NOT NULL DEFAULT 1);
)sql";

}  // namespace TarnCtl::Store
