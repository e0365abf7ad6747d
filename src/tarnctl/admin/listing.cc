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

namespace TarnCtl::Admin {
namespace {

// Field `field` of the rows whose first field is `owner` (any, when empty).
std::vector<std::string> Column(const std::vector<ListRow>& rows, size_t field,
                                const std::string& owner = "") {
  std::vector<std::string> values;
  for (const auto& row : rows) {
    if (owner.empty() || row[0] == owner) values.push_back(row[field]);
  }
  return values;
}

}  // namespace

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
  std::vector<std::string> names;
  auto add = [&](const std::vector<std::string>& more) {
    names.insert(names.end(), more.begin(), more.end());
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
      add(Column(ListSystemSwitches(db), 0));
      break;
    case ObjectKind::kDVSwitch:
      add(Column(ListDVSwitches(db), 0));
      break;
    case ObjectKind::kOpaqueSwitch:
      add(Column(ListOpaqueSwitches(db), 0));
      break;
    case ObjectKind::kClient:
      add(Column(ListClients(db), 1, owner));
      break;
    case ObjectKind::kFault:
      add(Column(ListFaults(db), 0));
      break;
    case ObjectKind::kDVPort:
      add(Column(ListDVPorts(db), 1, owner));
      break;
    case ObjectKind::kPortGroup:
      add(PortGroupNames(db));
      break;
    case ObjectKind::kSwitch:
    case ObjectKind::kPortset:
    case ObjectKind::kObject: {
      const auto dvs = ListDVSwitches(db), opaque = ListOpaqueSwitches(db);
      // A standard switch is its own portset; the others have one each.
      add(StandardSwitchNames(db));
      if (kind != ObjectKind::kPortset) add(Column(dvs, 0));
      if (kind != ObjectKind::kSwitch) {
        add(Column(dvs, 1));
        add(Column(opaque, 1));
      }
      if (kind == ObjectKind::kObject) {
        add(Column(opaque, 0));
        add(PortGroupNames(db));
        add(Column(ListDVPorts(db), 1));
      }
      break;
    }
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
