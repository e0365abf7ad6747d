#include "tarnctl/names.h"

#include "hostctl/network.h"
#include "tarnctl/errors.h"
#include "tarnctl/policy_codec.h"
#include "tarnctl/session.h"

namespace TarnCtl::Detail {

std::optional<PortsetName> FindPortset(Session& session, const std::string& portset) {
  if (session.Prepare("SELECT 1 FROM vswitch WHERE layer = 1 AND name = ?")
          .Bind(1, portset)
          .Step()) {
    return PortsetName{PortsetKind::kStandard, portset, portset};
  }
  {
    auto dvs = session.Prepare("SELECT name FROM dvswitch WHERE layer = 1 AND portset = ?");
    if (dvs.Bind(1, portset).Step())
      return PortsetName{PortsetKind::kDistributed, dvs.Text(0), portset};
  }
  auto opaque = session.Prepare("SELECT name FROM opaque WHERE portset = ?");
  if (opaque.Bind(1, portset).Step())
    return PortsetName{PortsetKind::kOpaque, opaque.Text(0), portset};
  return std::nullopt;
}

bool PortsetNameTaken(Session& session, const std::string& name) {
  return session
      .Prepare(
          "SELECT 1 FROM vswitch WHERE layer = 1 AND name = ?1"
          " UNION ALL SELECT 1 FROM dvswitch WHERE layer = 1 AND (name = ?1 OR portset = ?1)"
          " UNION ALL SELECT 1 FROM opaque WHERE name = ?1 OR portset = ?1")
      .Bind(1, name)
      .Step();
}

void CheckNewSwitchName(Session& session, const std::string& name) {
  if (name.empty()) throw Refused("Virtual switch name is empty");
  if (name.size() >= HostCtl::Network::Portset::MAX_VSNAME_SZ) {
    throw Refused(
        "Virtual switch name " + name + " is too long",
        "(at most " + std::to_string(HostCtl::Network::Portset::MAX_VSNAME_SZ - 1) + " bytes)");
  }
  if (PortsetNameTaken(session, name)) {
    throw Refused("Virtual switch " + name + " already exists", "on this host");
  }
}

bool PnicExists(Session& session, const std::string& pnic) {
  return session.Prepare("SELECT 1 FROM pnic WHERE name = ?").Bind(1, pnic).Step();
}

std::string PnicOwner(Session& session, const std::string& pnic) {
  {
    auto linked = session.Prepare(
        "SELECT switch FROM link WHERE layer = 1 AND pnic = ?1"
        " UNION ALL SELECT dvs FROM dvs_uplink WHERE layer = 1 AND pnic = ?1");
    if (linked.Bind(1, pnic).Step()) return linked.Text(0);
  }
  auto opaque = session.Prepare("SELECT name, uplinks FROM opaque ORDER BY seq");
  while (opaque.Step()) {
    for (const std::string& uplink : DecodeNameList(opaque.Text(1))) {
      if (uplink == pnic) return opaque.Text(0);
    }
  }
  return "";
}

void CheckFreePnic(Session& session, const std::string& pnic) {
  if (!PnicExists(session, pnic))
    throw Refused("Uplink " + pnic + " does not exist", "on this host");
  const std::string owner = PnicOwner(session, pnic);
  if (!owner.empty()) throw Refused(pnic + " is already linked to " + owner);
}

}  // namespace TarnCtl::Detail
