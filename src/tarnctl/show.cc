// The whole host as readable text, for people: pnics, the running state,
// the stored configuration, the distributed switch cache, and what is not
// layered (opaque switches, DVPorts, events, armed faults). Objects come in
// creation order, so two hosts built alike show alike. Dump() is the exact
// form; this one leaves out what nobody reads (link criteria).
#include <cstdio>
#include <string>
#include <vector>

#include "tarnctl/admin.h"
#include "tarnctl/admin_state.h"
#include "tarnctl/policy_codec.h"

namespace TarnCtl::Admin {
namespace {

using Detail::Session;

std::string Join(const std::vector<std::string>& items) {
  if (items.empty()) return "(none)";
  std::string out;
  for (const auto& item : items) out += (out.empty() ? "" : ", ") + item;
  return out;
}

std::vector<std::string> Column(Session& s, const char* sql, const std::string& arg,
                                int64_t layer = -1) {
  auto stmt = s.Prepare(sql);
  stmt.Bind(1, arg);
  if (layer >= 0) stmt.Bind(2, layer);
  std::vector<std::string> values;
  while (stmt.Step()) values.push_back(stmt.Text(0));
  return values;
}

std::string CdpWord(int64_t cdp) {
  static const char* words[] = {"down", "listen", "advertise", "both"};
  return cdp >= 0 && cdp <= 3 ? words[cdp] : std::to_string(cdp);
}

std::string Teaming(const std::string& stored) {
  const auto p = Detail::DecodeTeamingPolicy(stored);
  char flags[32];
  std::snprintf(flags, sizeof flags, "0x%llx", static_cast<unsigned long long>(p.flags));
  const bool ordered = p.flags & HostCtl::Network::NicTeamingPolicy::kUplinkOrderSet;
  return std::string("Teaming: flags ") + flags + ", order " +
         (ordered ? Join(p.uplinkOrder) : "(not set)") + ", max active " +
         std::to_string(p.maxActive) + ", balancing " + std::to_string(p.balancing) +
         ", failback " + std::to_string(p.failback);
}

void StandardSwitches(Session& s, std::string& out, int64_t layer) {
  auto sw = s.Prepare(
      "SELECT name, num_ports, mtu, cdp, system, policy FROM vswitch WHERE layer = ?1"
      " ORDER BY seq, name");
  sw.Bind(1, layer);
  bool any = false;
  while (sw.Step()) {
    any = true;
    const std::string name = sw.Text(0);
    out += "  Standard switch " + name + (sw.Int(4) ? " (system)" : "") + ": " +
           std::to_string(sw.Int(1)) + " ports, MTU " + std::to_string(sw.Int(2)) + ", CDP " +
           CdpWord(sw.Int(3)) + "\n";
    out += "    Uplinks: " +
           Join(Column(s, "SELECT pnic FROM link WHERE switch = ?1 AND layer = ?2 ORDER BY seq",
                       name, layer)) +
           "\n";
    out += "    " + Teaming(sw.Text(5)) + "\n";
    auto pg = s.Prepare(
        "SELECT name, vlan, policy FROM portgroup WHERE layer = ?1 AND switch = ?2"
        " ORDER BY seq, name");
    pg.Bind(1, layer).Bind(2, name);
    while (pg.Step()) {
      const std::string pgName = pg.Text(0);
      out += "    Port group " + pgName + ": VLAN " + std::to_string(pg.Int(1)) + ", clients " +
             Join(Column(s, "SELECT name FROM client WHERE portgroup = ?1 ORDER BY seq", pgName)) +
             "\n";
      out += "      " + Teaming(pg.Text(2)) + "\n";
    }
  }
  if (!any) out += "  Standard switches: (none)\n";
}

void DistributedSwitches(Session& s, std::string& out, int64_t layer) {
  auto dvs = s.Prepare(
      "SELECT name, portset, switch_id, uuid, impl_class, version, num_ports, mtu FROM dvswitch"
      " WHERE layer = ?1 ORDER BY seq, name");
  dvs.Bind(1, layer);
  bool any = false;
  while (dvs.Step()) {
    any = true;
    const std::string name = dvs.Text(0);
    out += "  Distributed switch " + name + ": portset " + dvs.Text(1) + ", id " + dvs.Text(2) +
           ", " + std::to_string(dvs.Int(6)) + " ports, MTU " + std::to_string(dvs.Int(7)) + "\n";
    out += "    UUID " + dvs.Text(3) + ", class " + dvs.Text(4) + ", version " +
           std::to_string(dvs.Int(5)) + "\n";
    auto up = s.Prepare(
        "SELECT pnic, port_id FROM dvs_uplink WHERE layer = ?1 AND dvs = ?2 ORDER BY seq, pnic");
    up.Bind(1, layer).Bind(2, name);
    std::vector<std::string> uplinks;
    while (up.Step()) {
      uplinks.push_back(up.Text(0) + (up.IsNull(1) ? "" : " (DVPort " + up.Text(1) + ")"));
    }
    out += "    Uplinks: " + Join(uplinks) + "\n";
  }
  if (!any) out += "  Distributed switches: (none)\n";
}

void Timeouts(Session& s, std::string& out, int64_t layer) {
  std::vector<std::string> rows;
  auto up = s.Prepare(
      "SELECT portset, uplink, lag_id, timeout FROM uplink_timeout WHERE layer = ?1"
      " ORDER BY portset, uplink, lag_id");
  up.Bind(1, layer);
  while (up.Step()) {
    rows.push_back(up.Text(0) + " " + up.Text(1) + " LAG " + std::to_string(up.Int(2)) + ": " +
                   std::to_string(up.Int(3)));
  }
  out += "  Uplink timeouts: " + Join(rows) + "\n";
  rows.clear();
  auto lag = s.Prepare(
      "SELECT portset, lag_id, timeout FROM lag_timeout WHERE layer = ?1 ORDER BY portset, lag_id");
  lag.Bind(1, layer);
  while (lag.Step()) {
    rows.push_back(lag.Text(0) + " LAG " + std::to_string(lag.Int(1)) + ": " +
                   std::to_string(lag.Int(2)));
  }
  out += "  LAG timeouts: " + Join(rows) + "\n";
}

void Ens(Session& s, std::string& out) {
  auto node = s.Prepare("SELECT value FROM meta WHERE key = 'ens_node'");
  const bool set = node.Step() && node.Text(0) == "1";
  std::vector<std::string> active;
  auto ens = s.Prepare("SELECT portset, intr, fast_switch FROM ens ORDER BY portset");
  while (ens.Step()) {
    active.push_back(ens.Text(0) + " (intr " + (ens.Int(1) ? "on" : "off") + ", fast switch " +
                     (ens.Int(2) ? "on" : "off") + ")");
  }
  out += std::string("  ENS: activation node ") + (set ? "set" : "not set") + "; active on " +
         Join(active) + "\n";
}

void Opaque(Session& s, std::string& out) {
  out += "\nOpaque switches\n";
  auto op = s.Prepare(
      "SELECT name, portset, num_ports, used_ports, uplinks FROM opaque ORDER BY seq, name");
  bool any = false;
  while (op.Step()) {
    any = true;
    const auto uplinks = Detail::DecodeNameList(op.Text(4));
    out += "  " + op.Text(0) + ": portset " + op.Text(1) + ", " + std::to_string(op.Int(2)) +
           " ports, " + std::to_string(op.Int(3)) + " used, uplinks " + Join(uplinks) + "\n";
  }
  if (!any) out += "  (none)\n";
}

void DVPorts(Session& s, std::string& out) {
  out += "\nDVPorts\n";
  auto port =
      s.Prepare("SELECT dvs, port_id, connection_id FROM dvport ORDER BY seq, dvs, port_id");
  bool any = false;
  while (port.Step()) {
    any = true;
    auto clients =
        s.Prepare("SELECT name FROM dvport_client WHERE dvs = ?1 AND port_id = ?2 ORDER BY seq");
    clients.Bind(1, port.Text(0)).Bind(2, port.Text(1));
    std::vector<std::string> names;
    while (clients.Step()) names.push_back(clients.Text(0));
    out += "  " + port.Text(0) + " port " + port.Text(1) + ": connection id " +
           std::to_string(port.Int(2)) + ", clients " + Join(names) + "\n";
  }
  if (!any) out += "  (none)\n";
}

void Events(Session& s, std::string& out) {
  out += "\nEvents\n";
  // Both kinds of events draw their seq from the one counter: merge them.
  auto ev = s.Prepare(
      "SELECT seq, 'DVPort ' || dvs || ' port ' || port_id || ': ' || kind FROM dvport_event"
      " UNION ALL SELECT seq, 'ENS reassociation on ' || portset || ': mode ' || mode ||"
      " ', force ' || force FROM ens_event ORDER BY 1");
  bool any = false;
  while (ev.Step()) {
    any = true;
    out += "  " + ev.Text(1) + "\n";
  }
  if (!any) out += "  (none)\n";
}

void Faults(Session& s, std::string& out) {
  out += "\nFaults\n";
  auto f =
      s.Prepare("SELECT operation, target, message, detail, skip, times FROM fault ORDER BY id");
  bool any = false;
  while (f.Step()) {
    any = true;
    out += "  " + f.Text(0) + (f.IsNull(1) ? "" : " on " + f.Text(1)) + ": lets " +
           std::to_string(f.Int(4)) + " pass, then fails " + std::to_string(f.Int(5)) +
           "; message \"" + f.Text(2) + "\", detail \"" + f.Text(3) + "\"\n";
  }
  if (!any) out += "  (none)\n";
}

}  // namespace

std::string Host::Show() {
  Session& s = *state_->session;
  std::string out;
  std::vector<std::string> pnics;
  auto pnic = s.Prepare("SELECT name FROM pnic ORDER BY seq");
  while (pnic.Step()) pnics.push_back(pnic.Text(0));
  out += "Physical NICs: " + Join(pnics) + "\n";

  out += "\nRunning state\n";
  StandardSwitches(s, out, 1);
  DistributedSwitches(s, out, 1);
  Ens(s, out);
  Timeouts(s, out, 1);

  out += "\nStored configuration\n";
  StandardSwitches(s, out, 0);
  Timeouts(s, out, 0);

  out += "\nDistributed switch cache\n";
  DistributedSwitches(s, out, 0);

  Opaque(s, out);
  DVPorts(s, out);
  Events(s, out);
  Faults(s, out);
  return out;
}

}  // namespace TarnCtl::Admin
