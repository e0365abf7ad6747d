// Seeding the host with what the tool cannot create itself: pnics, clients,
// system switches, distributed switches (as their management plane would),
// DVPorts, opaque switches and stored timeout records.
//
// Each call checks everything first and then writes in one transaction, so
// a refusal leaves the host as it was.
#include <cstdio>
#include <set>
#include <string>

#include "hostctl/exception.h"
#include "hostctl/records.h"
#include "hostctl/tarnctl.h"
#include "tarnctl/admin.h"
#include "tarnctl/admin_state.h"
#include "tarnctl/policy_codec.h"

namespace TarnCtl::Admin {
namespace {

using Detail::Session;
using Detail::Statement;
using Detail::Transaction;
using HostCtl::Lib::HostCtlException;

constexpr int32_t kMinPorts = 8;
constexpr int32_t kMaxPorts = 4096;
constexpr uint32_t kMinMtu = 1280;
constexpr uint32_t kMaxMtu = 9000;
constexpr uint32_t kMaxTimeout = 255;
constexpr size_t kMaxPortGroupName = 127;

[[noreturn]] void Refuse(const std::string& operation, const std::string& message) {
  throw HostCtlException(message, operation + ": " + message);
}

// Switch, portset and pnic names: non-empty and shorter than MAX_VSNAME_SZ.
void CheckShortName(const std::string& op, const std::string& what, const std::string& name) {
  if (name.empty()) Refuse(op, what + " name is empty");
  if (name.size() >= HostCtl::Network::Portset::MAX_VSNAME_SZ) {
    Refuse(op, what + " name " + name + " is too long (at most " +
                   std::to_string(HostCtl::Network::Portset::MAX_VSNAME_SZ - 1) + " bytes)");
  }
}

void CheckPorts(const std::string& op, int64_t ports) {
  if (ports < kMinPorts || ports > kMaxPorts) {
    Refuse(op, "Invalid number of ports " + std::to_string(ports) + ": must be " +
                   std::to_string(kMinPorts) + " to " + std::to_string(kMaxPorts));
  }
}

// Portset names are unique across standard, distributed and opaque switches
// in both layers.
void CheckPortsetNameFree(Session& s, const std::string& op, const std::string& name) {
  auto stmt = s.Prepare(
      "SELECT 1 FROM vswitch WHERE name = ?1"
      " UNION ALL SELECT 1 FROM dvswitch WHERE name = ?1 OR portset = ?1"
      " UNION ALL SELECT 1 FROM opaque WHERE name = ?1 OR portset = ?1 LIMIT 1");
  if (stmt.Bind(1, name).Step()) Refuse(op, "Virtual switch " + name + " already exists");
}

// The names and port count of a new distributed or opaque switch.
void CheckNewPortset(Session& s, const std::string& op, const std::string& name,
                     const std::string& portset, int32_t ports) {
  CheckShortName(op, "Virtual switch", name);
  CheckShortName(op, "Portset", portset);
  CheckPortsetNameFree(s, op, name);
  if (portset != name) CheckPortsetNameFree(s, op, portset);
  CheckPorts(op, ports);
}

bool PnicExists(Session& s, const std::string& name) {
  return s.Prepare("SELECT 1 FROM pnic WHERE name = ?1").Bind(1, name).Step();
}

// The switch a pnic is linked to in any layer (standard, distributed or
// opaque), or empty when it is free.
std::string PnicOwner(Session& s, const std::string& pnic) {
  auto stmt = s.Prepare(
      "SELECT switch FROM link WHERE pnic = ?1"
      " UNION ALL SELECT dvs FROM dvs_uplink WHERE pnic = ?1 LIMIT 1");
  if (stmt.Bind(1, pnic).Step()) return stmt.Text(0);
  auto opaque = s.Prepare("SELECT name, uplinks FROM opaque ORDER BY seq");
  while (opaque.Step()) {
    for (const auto& uplink : Detail::DecodeNameList(opaque.Text(1))) {
      if (uplink == pnic) return opaque.Text(0);
    }
  }
  return "";
}

// Uplinks of a new distributed or opaque switch: existing, free, each once.
void CheckUplinks(Session& s, const std::string& op, const std::vector<std::string>& uplinks) {
  std::set<std::string> seen;
  for (const auto& uplink : uplinks) {
    if (!seen.insert(uplink).second) Refuse(op, "Uplink " + uplink + " is given twice");
    if (!PnicExists(s, uplink)) Refuse(op, "Uplink " + uplink + " does not exist");
    auto owner = PnicOwner(s, uplink);
    if (!owner.empty()) Refuse(op, uplink + " is already linked to " + owner);
  }
}

// The UUID text a switch name gives: its first 15 bytes, zero-padded.
std::string UuidFromName(const std::string& name) {
  unsigned char b[16] = {};
  for (size_t i = 0; i < name.size() && i < 15; ++i) b[i] = static_cast<unsigned char>(name[i]);
  char text[48];
  std::snprintf(text, sizeof text,
                "%02x %02x %02x %02x %02x %02x %02x %02x-%02x %02x %02x %02x %02x %02x %02x %02x",
                b[0], b[1], b[2], b[3], b[4], b[5], b[6], b[7], b[8], b[9], b[10], b[11], b[12],
                b[13], b[14], b[15]);
  return text;
}

bool SwitchIdTaken(Session& s, const std::string& id) {
  return s.Prepare("SELECT 1 FROM dvswitch WHERE switch_id = ?1 LIMIT 1").Bind(1, id).Step();
}

}  // namespace

void Host::AddPnic(const std::string& name) {
  Session& s = *state_->session;
  Transaction tx(s);
  CheckShortName("AddPnic", "Pnic", name);
  if (PnicExists(s, name)) Refuse("AddPnic", "Pnic " + name + " already exists");
  s.Prepare("INSERT INTO pnic(seq, name) VALUES(?1, ?2)").Bind(1, s.NextSeq()).Bind(2, name).Run();
  tx.Commit();
}

void Host::AddClient(const std::string& portGroup, const std::string& client) {
  const std::string op = "AddClient";
  Session& s = *state_->session;
  Transaction tx(s);
  if (client.empty()) Refuse(op, "Client name is empty");
  if (client.size() > kMaxPortGroupName) Refuse(op, "Client name " + client + " is too long");
  auto pg = s.Prepare("SELECT switch FROM portgroup WHERE layer = 1 AND name = ?1");
  if (!pg.Bind(1, portGroup).Step()) Refuse(op, "Portgroup " + portGroup + " does not exist");
  const std::string sw = pg.Text(0);
  if (s.Prepare("SELECT 1 FROM client WHERE portgroup = ?1 AND name = ?2")
          .Bind(1, portGroup)
          .Bind(2, client)
          .Step()) {
    Refuse(op, "Client " + client + " is already on portgroup " + portGroup);
  }
  // Used ports of the switch: its running links and the clients of its
  // running port groups.
  auto used = s.Prepare(
      "SELECT (SELECT count(*) FROM link WHERE layer = 1 AND switch = ?1)"
      " + (SELECT count(*) FROM client c JOIN portgroup p ON p.layer = 1 AND p.name = c.portgroup"
      "    WHERE p.switch = ?1),"
      " (SELECT num_ports FROM vswitch WHERE layer = 1 AND name = ?1)");
  used.Bind(1, sw).Step();
  if (used.Int(0) >= used.Int(1)) Refuse(op, "Switch " + sw + " has no free port");
  s.Prepare("INSERT INTO client(portgroup, name, seq) VALUES(?1, ?2, ?3)")
      .Bind(1, portGroup)
      .Bind(2, client)
      .Bind(3, s.NextSeq())
      .Run();
  tx.Commit();
}

void Host::AddSystemSwitch(const std::string& name, int32_t ports) {
  const std::string op = "AddSystemSwitch";
  Session& s = *state_->session;
  Transaction tx(s);
  CheckShortName(op, "Virtual switch", name);
  CheckPortsetNameFree(s, op, name);
  CheckPorts(op, ports);
  HostCtl::Network::NicTeamingPolicy policy;
  policy.flags = HostCtl::Network::NicTeamingPolicy::kUplinkOrderSet;
  const std::string encoded = Detail::EncodeTeamingPolicy(policy);
  const int64_t seq = s.NextSeq();
  for (int layer : {0, 1}) {
    s.Prepare(
         "INSERT INTO vswitch(layer, name, seq, num_ports, mtu, cdp, system, policy)"
         " VALUES(?1, ?2, ?3, ?4, 1500, 1, 1, ?5)")
        .Bind(1, layer)
        .Bind(2, name)
        .Bind(3, seq)
        .Bind(4, ports)
        .Bind(5, encoded)
        .Run();
  }
  tx.Commit();
}

void Host::AddDVSwitch(const DVSwitchSeed& seed) {
  const std::string op = "AddDVSwitch";
  Session& s = *state_->session;
  Transaction tx(s);
  const std::string portset = seed.portset.value_or(seed.name);
  CheckNewPortset(s, op, seed.name, portset, seed.ports);
  if (seed.mtu < kMinMtu || seed.mtu > kMaxMtu) {
    Refuse(op, "MTU " + std::to_string(seed.mtu) + " is out of range (" + std::to_string(kMinMtu) +
                   " to " + std::to_string(kMaxMtu) + ")");
  }
  std::string id;
  if (seed.switchId) {
    id = *seed.switchId;
    if (id.empty()) Refuse(op, "Switch id is empty");
    if (SwitchIdTaken(s, id)) Refuse(op, "Switch id " + id + " is already in use");
  } else {
    id = "dvs-" + seed.name;
    for (int n = 2; SwitchIdTaken(s, id); ++n) id = "dvs-" + seed.name + "-" + std::to_string(n);
  }
  CheckUplinks(s, op, seed.uplinks);
  const int64_t seq = s.NextSeq();
  for (int layer : {0, 1}) {
    s.Prepare(
         "INSERT INTO dvswitch(layer, name, portset, switch_id, uuid, impl_class, version,"
         " num_ports, mtu, seq) VALUES(?1, ?2, ?3, ?4, ?5, 'cswitch', 0, ?6, ?7, ?8)")
        .Bind(1, layer)
        .Bind(2, seed.name)
        .Bind(3, portset)
        .Bind(4, id)
        .Bind(5, UuidFromName(seed.name))
        .Bind(6, seed.ports)
        .Bind(7, seed.mtu)
        .Bind(8, seq)
        .Run();
  }
  for (const auto& uplink : seed.uplinks) {
    const int64_t useq = s.NextSeq();
    for (int layer : {0, 1}) {
      s.Prepare(
           "INSERT INTO dvs_uplink(layer, pnic, dvs, port_id, seq) VALUES(?1, ?2, ?3, NULL, ?4)")
          .Bind(1, layer)
          .Bind(2, uplink)
          .Bind(3, seed.name)
          .Bind(4, useq)
          .Run();
    }
  }
  tx.Commit();
}

void Host::AddDVPort(const DVPortSeed& seed) {
  const std::string op = "AddDVPort";
  Session& s = *state_->session;
  Transaction tx(s);
  auto sw = s.Prepare("SELECT num_ports FROM dvswitch WHERE layer = 1 AND name = ?1");
  if (!sw.Bind(1, seed.dvs).Step()) {
    Refuse(op, "DVS " + seed.dvs + " does not exist");
  }
  const int64_t ports = sw.Int(0);
  if (seed.portId.empty()) Refuse(op, "DVPort id is empty");
  if (s.Prepare("SELECT 1 FROM dvport WHERE dvs = ?1 AND port_id = ?2")
          .Bind(1, seed.dvs)
          .Bind(2, seed.portId)
          .Step()) {
    Refuse(op, "DVPort " + seed.portId + " already exists on " + seed.dvs);
  }
  auto count = s.Prepare("SELECT count(*) FROM dvport WHERE dvs = ?1");
  count.Bind(1, seed.dvs).Step();
  if (count.Int(0) >= ports) Refuse(op, "Switch " + seed.dvs + " has no free port");
  std::set<std::string> seen;
  for (const auto& client : seed.clients) {
    if (client.empty()) Refuse(op, "Client name is empty");
    if (client.size() > kMaxPortGroupName) Refuse(op, "Client name " + client + " is too long");
    if (!seen.insert(client).second) Refuse(op, "Client " + client + " is given twice");
  }
  s.Prepare("INSERT INTO dvport(dvs, port_id, connection_id, seq) VALUES(?1, ?2, ?3, ?4)")
      .Bind(1, seed.dvs)
      .Bind(2, seed.portId)
      .Bind(3, seed.connectionId)
      .Bind(4, s.NextSeq())
      .Run();
  for (const auto& client : seed.clients) {
    s.Prepare("INSERT INTO dvport_client(dvs, port_id, name, seq) VALUES(?1, ?2, ?3, ?4)")
        .Bind(1, seed.dvs)
        .Bind(2, seed.portId)
        .Bind(3, client)
        .Bind(4, s.NextSeq())
        .Run();
  }
  tx.Commit();
}

void Host::AddOpaqueSwitch(const OpaqueSeed& seed) {
  const std::string op = "AddOpaqueSwitch";
  Session& s = *state_->session;
  Transaction tx(s);
  const std::string portset = seed.portset.value_or(seed.name);
  CheckNewPortset(s, op, seed.name, portset, seed.ports);
  if (seed.used < 0 || seed.used > seed.ports) {
    Refuse(op, "Invalid number of used ports " + std::to_string(seed.used) + ": must be 0 to " +
                   std::to_string(seed.ports));
  }
  CheckUplinks(s, op, seed.uplinks);
  s.Prepare(
       "INSERT INTO opaque(name, portset, num_ports, used_ports, uplinks, seq)"
       " VALUES(?1, ?2, ?3, ?4, ?5, ?6)")
      .Bind(1, seed.name)
      .Bind(2, portset)
      .Bind(3, seed.ports)
      .Bind(4, seed.used)
      .Bind(5, Detail::EncodeNameList(seed.uplinks))
      .Bind(6, s.NextSeq())
      .Run();
  tx.Commit();
}

namespace {

void CheckTimeout(const std::string& op, const std::string& portset, uint32_t timeout) {
  CheckShortName(op, "Portset", portset);
  if (timeout > kMaxTimeout) {
    Refuse(op, "Invalid timeout " + std::to_string(timeout) + ": must be 0 to " +
                   std::to_string(kMaxTimeout));
  }
}

// Runs an "INSERT OR IGNORE ... RETURNING 1" to its end: false when the
// row was ignored because its key is taken.
bool InsertedOne(Statement& insert) {
  bool inserted = false;
  while (insert.Step()) inserted = true;
  return inserted;
}

}  // namespace

void Host::AddUplinkTimeout(const std::string& portset, const std::string& uplink, uint32_t lagId,
                            uint32_t timeout) {
  const std::string op = "AddUplinkTimeout";
  Session& s = *state_->session;
  Transaction tx(s);
  CheckTimeout(op, portset, timeout);
  if (uplink.empty()) Refuse(op, "Uplink name is empty");
  if (!InsertedOne(s.Prepare("INSERT OR IGNORE INTO uplink_timeout(layer, portset, uplink,"
                             " lag_id, timeout) VALUES(0, ?1, ?2, ?3, ?4) RETURNING 1")
                       .Bind(1, portset)
                       .Bind(2, uplink)
                       .Bind(3, lagId)
                       .Bind(4, timeout))) {
    Refuse(op, "An uplink timeout for " + portset + ", " + uplink + ", LAG " +
                   std::to_string(lagId) + " is already stored");
  }
  tx.Commit();
}

void Host::AddLagTimeout(const std::string& portset, uint32_t lagId, uint32_t timeout) {
  const std::string op = "AddLagTimeout";
  Session& s = *state_->session;
  Transaction tx(s);
  CheckTimeout(op, portset, timeout);
  if (!InsertedOne(s.Prepare("INSERT OR IGNORE INTO lag_timeout(layer, portset, lag_id, timeout)"
                             " VALUES(0, ?1, ?2, ?3) RETURNING 1")
                       .Bind(1, portset)
                       .Bind(2, lagId)
                       .Bind(3, timeout))) {
    Refuse(op, "A LAG timeout for " + portset + ", LAG " + std::to_string(lagId) +
                   " is already stored");
  }
  tx.Commit();
}

}  // namespace TarnCtl::Admin
