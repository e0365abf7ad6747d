// The host's objects as lists for scripts (tarnhost's NOUN list) and their
// names for completion. Which switch uses a pnic is the model's rule, the
// one that refuses a pnic to another switch.
#include <set>
#include <string>
#include <vector>

#include "tarnctl/admin/host.h"
#include "tarnctl/admin/state.h"
#include "tarnctl/instrument/call.h"
#include "tarnctl/instrument/trace.h"
#include "tarnctl/model/names.h"
#include "tarnctl/store/distributed.h"
#include "tarnctl/store/dvports.h"
#include "tarnctl/store/faults.h"
#include "tarnctl/store/opaque.h"
#include "tarnctl/store/pnics.h"
#include "tarnctl/store/portgroups.h"
#include "tarnctl/store/standard.h"
#include "tarnctl/store/timeouts.h"

namespace TarnCtl::Admin {
namespace {

using Store::Db;
using Store::Layer;

std::string Commas(const std::vector<std::string>& names) {
  std::string text;
  for (const auto& name : names) text += (text.empty() ? "" : ",") + name;
  return text;
}

std::vector<ListRow> Pnics(Db& db) {
  std::vector<ListRow> rows;
  for (const auto& name : Store::Pnics::Names(db)) {
    rows.push_back({name, Model::PnicOwner(db, name).value_or(""),
                    Store::Pnics::LinkedSwitch(db, Layer::kStored, name).value_or("")});
  }
  return rows;
}

std::vector<ListRow> Clients(Db& db) {
  std::vector<ListRow> rows;
  for (const auto& client : Store::PortGroups::AllClients(db)) {
    rows.push_back({client.portGroup, client.name});
  }
  return rows;
}

std::vector<ListRow> SystemSwitches(Db& db) {
  std::vector<ListRow> rows;
  for (const auto& sw : Store::Standard::List(db, Layer::kRunning, true)) {
    rows.push_back({sw.name, std::to_string(sw.row.numPorts),
                    std::to_string(Store::Standard::UsedPorts(db, sw.name)),
                    Commas(Store::Standard::Uplinks(db, Layer::kRunning, sw.name))});
  }
  return rows;
}

std::vector<std::string> DVSwitchUplinks(Db& db, const std::string& dvs,
                                         const std::string* onPort = nullptr) {
  std::vector<std::string> pnics;
  for (const auto& uplink : Store::Distributed::Uplinks(db, Layer::kRunning, dvs)) {
    if (!onPort || uplink.portId == *onPort) pnics.push_back(uplink.pnic);
  }
  return pnics;
}

std::vector<ListRow> DVSwitches(Db& db) {
  std::vector<ListRow> rows;
  for (const auto& dvs : Store::Distributed::List(db, Layer::kRunning)) {
    rows.push_back({dvs.name, dvs.row.portset, dvs.row.switchId, std::to_string(dvs.row.numPorts),
                    std::to_string(Store::Distributed::UsedPorts(db, dvs.name)),
                    Commas(DVSwitchUplinks(db, dvs.name))});
  }
  return rows;
}

std::vector<ListRow> OpaqueSwitches(Db& db) {
  std::vector<ListRow> rows;
  for (const auto& opaque : Store::Opaque::List(db)) {
    rows.push_back({opaque.name, opaque.row.portset, std::to_string(opaque.row.numPorts),
                    std::to_string(opaque.row.usedPorts), Commas(opaque.row.uplinks)});
  }
  return rows;
}

std::vector<ListRow> DVPorts(Db& db) {
  std::vector<ListRow> rows;
  for (const auto& [dvs, port] : Store::DVPorts::All(db)) {
    ListRow row{dvs, port.portId, std::to_string(port.connectionId),
                Commas(DVSwitchUplinks(db, dvs, &port.portId))};
    for (auto& client : Store::DVPorts::Clients(db, dvs, port.portId)) row.push_back(client);
    rows.push_back(std::move(row));
  }
  return rows;
}

std::vector<ListRow> Timeouts(Db& db) {
  std::vector<ListRow> rows;
  for (const auto& r : Store::Timeouts::Uplinks(db, Layer::kStored, {})) {
    rows.push_back({"uplink", r.portsetName, r.uplinkName, std::to_string(r.lagId),
                    std::to_string(r.timeout)});
  }
  for (const auto& r : Store::Timeouts::Lags(db, Layer::kStored, {})) {
    rows.push_back({"lag", r.portsetName, "", std::to_string(r.lagId), std::to_string(r.timeout)});
  }
  return rows;
}

std::vector<ListRow> Faults(Db& db) {
  std::vector<ListRow> rows;
  for (const auto& fault : Store::Faults::List(db)) {
    // Fault texts are free bytes: quoted and escaped as the trace writes
    // strings, so that each fault stays on its line and in its field.
    std::string message, detail;
    Instrument::AppendArg(message, fault.message);
    Instrument::AppendArg(detail, fault.detail);
    rows.push_back({std::to_string(fault.id), fault.operation, fault.target.value_or(""),
                    std::to_string(fault.skip), std::to_string(fault.times), message, detail});
  }
  return rows;
}

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

std::vector<ListRow> Host::List(Listing what) {
  Db& db = state_->db();
  Instrument::Scope scope(db, "List");  // reads whole tables, as Show does
  switch (what) {
    case Listing::kPnics:
      return Pnics(db);
    case Listing::kClients:
      return Clients(db);
    case Listing::kSystemSwitches:
      return SystemSwitches(db);
    case Listing::kDVSwitches:
      return DVSwitches(db);
    case Listing::kOpaqueSwitches:
      return OpaqueSwitches(db);
    case Listing::kDVPorts:
      return DVPorts(db);
    case Listing::kTimeouts:
      return Timeouts(db);
    case Listing::kFaults:
      return Faults(db);
  }
  return {};
}

std::vector<std::string> Host::Names(ObjectKind kind, const std::string& owner) {
  Db& db = state_->db();
  Instrument::Scope scope(db, "List");
  std::vector<std::string> names;
  auto add = [&](const std::vector<std::string>& more) {
    names.insert(names.end(), more.begin(), more.end());
  };
  const bool object = kind == ObjectKind::kObject;
  switch (kind) {
    case ObjectKind::kPnic:
      add(Store::Pnics::Names(db));
      break;
    case ObjectKind::kFreePnic:
      for (const auto& row : Pnics(db)) {
        if (row[1].empty()) names.push_back(row[0]);
      }
      break;
    case ObjectKind::kSystemSwitch:
      add(Column(SystemSwitches(db), 0));
      break;
    case ObjectKind::kDVSwitch:
      add(Column(DVSwitches(db), 0));
      break;
    case ObjectKind::kOpaqueSwitch:
      add(Column(OpaqueSwitches(db), 0));
      break;
    case ObjectKind::kClient:
      add(Column(Clients(db), 1, owner));
      break;
    case ObjectKind::kFault:
      add(Column(Faults(db), 0));
      break;
    case ObjectKind::kDVPort:
      add(Column(DVPorts(db), 1, owner));
      break;
    case ObjectKind::kPortGroup:
      add(Store::PortGroups::Names(db, Layer::kRunning));
      break;
    case ObjectKind::kSwitch:
    case ObjectKind::kPortset:
    case ObjectKind::kObject: {
      const auto dvs = DVSwitches(db), opaque = OpaqueSwitches(db);
      // A standard switch is its own portset; the others have one each.
      for (const auto& sw : Store::Standard::ListAll(db, Layer::kRunning)) names.push_back(sw.name);
      if (kind != ObjectKind::kPortset) add(Column(dvs, 0));
      if (kind != ObjectKind::kSwitch) {
        add(Column(dvs, 1));
        add(Column(opaque, 1));
      }
      if (object) {
        add(Column(opaque, 0));
        add(Store::PortGroups::Names(db, Layer::kRunning));
        add(Column(DVPorts(db), 1));
      }
      break;
    }
  }
  std::set<std::string> seen;
  std::erase_if(names, [&](const std::string& name) { return !seen.insert(name).second; });
  return names;
}

std::vector<std::string> Host::PeekNames(ObjectKind kind, const std::string& owner) {
  try {
    auto session = Api::Session::AcquireAt(Api::Session::DefaultLocation(), {0, false});
    return Host(std::make_unique<State>(State{std::move(session)})).Names(kind, owner);
  } catch (const HostCtl::Lib::HostCtlException&) {
    return {};
  }
}

}  // namespace TarnCtl::Admin
