#include "tarnctl/store/checks.h"

#include "tarnctl/store/db.h"

namespace TarnCtl::Store::Checks {

namespace {

Offender First(Db& db, const char* sql, int columns) {
  auto select = db.Prepare(sql);
  if (!select.Step()) return std::nullopt;
  std::vector<std::string> values;
  for (int i = 0; i < columns; ++i) values.push_back(select.Text(i));
  return values;
}

// Every pnic a running switch uses, once per use.
#define TARN_RUNNING_PNICS                                                                      \
  "SELECT pnic FROM link WHERE layer = 1 UNION ALL SELECT pnic FROM dvs_uplink WHERE layer = 1" \
  " UNION ALL SELECT u.value FROM opaque o, json_each(o.uplinks) u"

}  // namespace

// Looks up each switch that port groups name once, not once per port group
// (the port groups of a switch are next to each other in portgroup_switch).
Offender PortGroupWithoutSwitch(Db& db) {
  return First(db,
               "SELECT p.name, p.switch, p.layer FROM"
               " (SELECT DISTINCT switch, layer FROM portgroup) d, portgroup p"
               " WHERE NOT EXISTS (SELECT 1 FROM vswitch v WHERE v.layer = d.layer"
               " AND v.name = d.switch) AND p.switch = d.switch AND p.layer = d.layer LIMIT 1",
               3);
}

Offender LinkWithoutSwitch(Db& db) {
  return First(db,
               "SELECT pnic, switch, layer FROM link l WHERE NOT EXISTS"
               " (SELECT 1 FROM vswitch v WHERE v.layer = l.layer AND v.name = l.switch) LIMIT 1",
               3);
}

Offender LinkOfUnknownPnic(Db& db) {
  return First(db,
               "SELECT pnic, switch FROM link l"
               " WHERE NOT EXISTS (SELECT 1 FROM pnic WHERE name = l.pnic) LIMIT 1",
               2);
}

Offender UplinkWithoutSwitch(Db& db) {
  return First(db,
               "SELECT pnic, dvs, layer FROM dvs_uplink u WHERE NOT EXISTS"
               " (SELECT 1 FROM dvswitch d WHERE d.layer = u.layer AND d.name = u.dvs) LIMIT 1",
               3);
}

Offender UplinkOfUnknownPnic(Db& db) {
  return First(db,
               "SELECT pnic, dvs FROM dvs_uplink u"
               " WHERE NOT EXISTS (SELECT 1 FROM pnic WHERE name = u.pnic) LIMIT 1",
               2);
}

Offender UplinkOnUnknownPort(Db& db) {
  return First(db,
               "SELECT pnic, port_id FROM dvs_uplink u WHERE port_id IS NOT NULL AND NOT EXISTS"
               " (SELECT 1 FROM dvport p WHERE p.dvs = u.dvs AND p.port_id = u.port_id) LIMIT 1",
               2);
}

Offender ClientOnUnknownPort(Db& db) {
  return First(db,
               "SELECT name, port_id FROM dvport_client c WHERE NOT EXISTS"
               " (SELECT 1 FROM dvport p WHERE p.dvs = c.dvs AND p.port_id = c.port_id) LIMIT 1",
               2);
}

Offender OpaqueUplinkUnknown(Db& db) {
  return First(db,
               "SELECT u.value, o.name FROM opaque o, json_each(o.uplinks) u"
               " WHERE NOT EXISTS (SELECT 1 FROM pnic WHERE name = u.value) LIMIT 1",
               2);
}

Offender PnicUsedTwice(Db& db) {
  return First(
      db, "SELECT pnic FROM (" TARN_RUNNING_PNICS ") GROUP BY pnic HAVING count(*) > 1 LIMIT 1", 1);
}

Offender SwitchNameUsedTwice(Db& db) {
  return First(db,
               "SELECT n FROM (SELECT name AS n FROM vswitch WHERE layer = 1"
               " UNION ALL SELECT name FROM dvswitch WHERE layer = 1"
               " UNION ALL SELECT portset FROM dvswitch WHERE layer = 1 AND portset <> name"
               " UNION ALL SELECT name FROM opaque"
               " UNION ALL SELECT portset FROM opaque WHERE portset <> name)"
               " GROUP BY n HAVING count(*) > 1 LIMIT 1",
               1);
}

Offender OverfullStandardSwitch(Db& db) {
  return First(db,
               "SELECT name, used, num_ports FROM (SELECT v.name, v.num_ports,"
               " (SELECT count(*) FROM link l WHERE l.layer = 1 AND l.switch = v.name)"
               " + (SELECT count(*) FROM portgroup p JOIN client c ON c.portgroup = p.name"
               "    WHERE p.layer = 1 AND p.switch = v.name) AS used"
               " FROM vswitch v WHERE v.layer = 1) WHERE used > num_ports LIMIT 1",
               3);
}

Offender OverfullDistributedSwitch(Db& db) {
  return First(db,
               "SELECT name, ports, num_ports FROM (SELECT d.name, d.num_ports,"
               " (SELECT count(*) FROM dvport p WHERE p.dvs = d.name) AS ports"
               " FROM dvswitch d WHERE d.layer = 1) WHERE ports > num_ports LIMIT 1",
               3);
}

Offender EnsOnUnknownPortset(Db& db) {
  return First(
      db,
      "SELECT portset FROM ens e WHERE NOT EXISTS"
      " (SELECT 1 FROM vswitch v WHERE v.layer = 1 AND v.name = e.portset)"
      " AND NOT EXISTS (SELECT 1 FROM dvswitch d WHERE d.layer = 1 AND d.portset = e.portset)"
      " LIMIT 1",
      1);
}

#undef TARN_RUNNING_PNICS

}  // namespace TarnCtl::Store::Checks
