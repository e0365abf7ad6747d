#include "tarnctl/store/reset.h"

#include <cassert>
#include <string>
#include <utility>
#include <vector>

#include "tarnctl/store/db.h"
#include "tarnctl/store/default_host.h"
#include "tarnctl/store/schema.h"

namespace TarnCtl::Store::Reset {

namespace {

// An SQL identifier, quoted: the names come from the file, not from us.
std::string Quoted(const std::string& name) {
  std::string quoted = "\"";
  for (const char c : name) quoted += c == '"' ? std::string("\"\"") : std::string(1, c);
  return quoted + "\"";
}

}  // namespace

void Rebuild(Db& db, bool empty) {
  assert(db.depth() > 0 && "a rebuild is one transaction");
  std::vector<std::pair<std::string, std::string>> objects;
  {
    auto select = db.Prepare(
        "SELECT type, name FROM sqlite_schema"
        " WHERE type IN ('table', 'view', 'trigger') AND name NOT LIKE 'sqlite_%'");
    while (select.Step()) objects.emplace_back(select.Text(0), select.Text(1));
  }
  for (const auto& [type, name] : objects) {
    // Dropping a table drops its triggers: those may be gone already.
    db.Exec("DROP " +
            std::string(type == "table"  ? "TABLE"
                        : type == "view" ? "VIEW"
                                         : "TRIGGER") +
            " IF EXISTS " + Quoted(name));
  }
  db.Exec(std::string(kSchemaSql) + HostSql(!empty));
}

void Reboot(Db& db) {
  for (const char* sql :
       {"DELETE FROM vswitch WHERE layer = 1", "DELETE FROM portgroup WHERE layer = 1",
        "DELETE FROM link WHERE layer = 1", "DELETE FROM dvswitch WHERE layer = 1",
        "DELETE FROM dvs_uplink WHERE layer = 1", "DELETE FROM uplink_timeout WHERE layer = 1",
        "DELETE FROM lag_timeout WHERE layer = 1", "DELETE FROM ens",
        "UPDATE meta SET value = '0' WHERE key = 'ens_node'"}) {
    db.Prepare(sql).Run();
  }
}

void RestoreStandard(Db& db) {
  db.Prepare(R"sql(
    INSERT INTO vswitch(layer, name, seq, num_ports, mtu, cdp, system, policy)
      SELECT 1, name, seq, num_ports, mtu, cdp, system, policy FROM vswitch s
      WHERE s.layer = 0
        AND NOT EXISTS (SELECT 1 FROM vswitch r WHERE r.layer = 1 AND r.name = s.name)
        AND NOT EXISTS (SELECT 1 FROM dvswitch d
                        WHERE d.layer = 1 AND (d.name = s.name OR d.portset = s.name))
        AND NOT EXISTS (SELECT 1 FROM opaque o WHERE o.name = s.name OR o.portset = s.name)
  )sql")
      .Run();
  db.Prepare(R"sql(
    INSERT INTO portgroup(layer, name, switch, seq, vlan, policy)
      SELECT 1, name, switch, seq, vlan, policy FROM portgroup s
      WHERE s.layer = 0
        AND NOT EXISTS (SELECT 1 FROM portgroup r WHERE r.layer = 1 AND r.name = s.name)
        AND EXISTS (SELECT 1 FROM vswitch r WHERE r.layer = 1 AND r.name = s.switch)
  )sql")
      .Run();
}

void RestoreDistributed(Db& db) {
  db.Prepare(R"sql(
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
                        WHERE o.name IN (s.name, s.portset) OR o.portset IN (s.name, s.portset))
  )sql")
      .Run();
  db.Prepare(R"sql(
    INSERT INTO dvs_uplink(layer, pnic, dvs, port_id, seq)
      SELECT 1, pnic, dvs, port_id, seq FROM dvs_uplink s
      WHERE s.layer = 0
        AND EXISTS (SELECT 1 FROM dvswitch d WHERE d.layer = 1 AND d.name = s.dvs)
        AND NOT EXISTS (SELECT 1 FROM dvs_uplink r WHERE r.layer = 1 AND r.pnic = s.pnic)
        AND NOT EXISTS (SELECT 1 FROM link l WHERE l.layer = 1 AND l.pnic = s.pnic)
        AND NOT EXISTS (SELECT 1 FROM opaque o, json_each(o.uplinks) u WHERE u.value = s.pnic)
  )sql")
      .Run();
}

}  // namespace TarnCtl::Store::Reset
