#include "tarnctl/admin/listing.h"

#include <set>

#include "tarnctl/admin/distributed.h"
#include "tarnctl/admin/dvport.h"
#include "tarnctl/admin/faults.h"
#include "tarnctl/admin/host.h"
#include "tarnctl/admin/opaque.h"
#include "tarnctl/admin/pnic.h"
#include "tarnctl/admin/standard.h"
#include "tarnctl/admin/timeouts.h"
#include "tarnctl/api/session.h"
#include "tarnctl/instrument/call.h"
#include "tarnctl/store/distributed.h"
#include "tarnctl/store/dvports.h"
#include "tarnctl/store/opaque.h"
#include "tarnctl/store/portgroups.h"
#include "tarnctl/store/standard.h"

namespace TarnCtl::Admin {
std::vector<ListRow> List(Store::Db& db, Listing what) {
  Instrument::Scope scope(db, "List");  // reads whole tables, as Show does
  switch (what) {
    case Listing::kPnics:
      return ListPnics(db);
    case Listing::kClients:
      return ListClients(db);
    case Listing::kSystemSwitches:
      return ListSystemSwitches(db);
    case Listing::kDVSwitches:
      return ListDVSwitches(db);
    case Listing::kOpaqueSwitches:
      return ListOpaqueSwitches(db);
    case Listing::kDVPorts:
      return ListDVPorts(db);
    case Listing::kTimeouts:
      return ListTimeouts(db);
    case Listing::kFaults:
      return ListFaults(db);
    case Listing::kArmedFaults:
      return ListFaults(db, true);
  }
  return {};
}

std::vector<std::string> Names(Store::Db& db, ObjectKind kind, const std::string& owner) {
  Instrument::Scope scope(db, "List");
  using Store::Layer;
  std::vector<std::string> names;
  auto add = [&](const std::vector<std::string>& more) {
    names.insert(names.end(), more.begin(), more.end());
  };
  // Names (and portsets) straight from the store, no list rows rendered.
  auto dvSwitches = [&](bool name, bool portset) {
    for (const auto& sw : Store::Distributed::List(db, Layer::kRunning)) {
      if (name) names.push_back(sw.name);
      if (portset) names.push_back(sw.row.portset);
    }
  };
  auto opaqueSwitches = [&](bool name, bool portset) {
    for (const auto& sw : Store::Opaque::List(db)) {
      if (name) names.push_back(sw.name);
      if (portset) names.push_back(sw.row.portset);
    }
  };
  auto dvPorts = [&](bool qualified) {
    for (const auto& [dvs, port] : Store::DVPorts::All(db)) {
      if (owner.empty() || dvs == owner)
        names.push_back(qualified ? DVPortName(dvs, port.portId) : port.portId);
    }
  };
  switch (kind) {
    case ObjectKind::kPnic:
      add(PnicNames(db));
      break;
    case ObjectKind::kFreePnic:
      for (const auto& pnic : Pnics(db)) {
        if (pnic.user.empty()) names.push_back(pnic.name);
      }
      break;
    case ObjectKind::kSystemSwitch:
      for (auto& sw : Store::Standard::List(db, Layer::kRunning, true)) names.push_back(sw.name);
      break;
    case ObjectKind::kDVSwitch:
      dvSwitches(true, false);
      break;
    case ObjectKind::kOpaqueSwitch:
      opaqueSwitches(true, false);
      break;
    case ObjectKind::kClient:
      for (auto& client : Store::PortGroups::AllClients(db)) {
        if (owner.empty() || client.portGroup == owner) names.push_back(std::move(client.name));
      }
      break;
    case ObjectKind::kFault:
      for (const auto& fault : Faults(db)) names.push_back(std::to_string(fault.id));
      break;
    case ObjectKind::kDVPort:
      dvPorts(false);
      break;
    case ObjectKind::kPortGroup:
      add(PortGroupNames(db));
      break;
    case ObjectKind::kSwitch:
    case ObjectKind::kPortset:
    case ObjectKind::kObject:
      // A standard switch is its own portset; the others have one each.
      add(StandardSwitchNames(db));
      dvSwitches(kind != ObjectKind::kPortset, kind != ObjectKind::kSwitch);
      opaqueSwitches(kind == ObjectKind::kObject, kind != ObjectKind::kSwitch);
      if (kind == ObjectKind::kObject) {
        add(PortGroupNames(db));
        dvPorts(false);
      }
      break;
    case ObjectKind::kShowable:
      add(StandardSwitchNames(db));
      dvSwitches(true, false);
      opaqueSwitches(true, false);
      add(PortGroupNames(db));
      dvPorts(true);
      break;
  }
  std::set<std::string> seen;
  std::erase_if(names, [&](const std::string& name) { return !seen.insert(name).second; });
  return names;
}

std::vector<std::string> PeekNames(ObjectKind kind, const std::string& owner) {
  try {
    Host host = Host::Open(Api::Session::DefaultLocation(), {0, false});
    return Names(host.db(), kind, owner);
  } catch (const HostCtl::Lib::HostCtlException&) {
    return {};
  }
}

}  // namespace TarnCtl::Admin
