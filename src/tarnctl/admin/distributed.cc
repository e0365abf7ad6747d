#include "tarnctl/admin/distributed.h"

#include "tarnctl/admin/pnic.h"
#include "tarnctl/api/create.h"
#include "tarnctl/api/remove.h"
#include "tarnctl/instrument/call.h"
#include "tarnctl/instrument/errors.h"
#include "tarnctl/model/capacity.h"
#include "tarnctl/model/names.h"
#include "tarnctl/model/words.h"
#include "tarnctl/store/meta.h"
#include "tarnctl/store/transaction.h"

namespace TarnCtl::Admin {

using Instrument::Refused;
using Instrument::Scope;
using Store::Layer;

std::vector<DVSwitch> DVSwitches(Store::Db& db, Layer layer) {
  std::vector<DVSwitch> switches;
  for (auto& dvs : Store::Distributed::List(db, layer)) {
    auto uplinks = Store::Distributed::Uplinks(db, layer, dvs.name);
    switches.push_back({std::move(dvs.name), std::move(dvs.row), std::move(uplinks)});
  }
  return switches;
}

std::optional<DVSwitch> FindDVSwitch(Store::Db& db, Layer layer, const std::string& name) {
  auto row = Store::Distributed::Find(db, layer, name);
  if (!row) return std::nullopt;
  return DVSwitch{name, std::move(*row), Store::Distributed::Uplinks(db, layer, name)};
}

void AddDVSwitch(Store::Db& db, const DVSwitchSeed& seed) {
  Scope scope(db, "AddDVSwitch");
  Model::CheckName(Model::NameKind::kSwitch, seed.name);
  std::string id;
  if (seed.switchId) {
    id = *seed.switchId;
  } else {
    id = "dvs-" + seed.name;
    for (int n = 2; Store::Distributed::NameOfSwitchId(db, Layer::kRunning, id); ++n) {
      id = "dvs-" + seed.name + "-" + std::to_string(n);
    }
  }
  CheckFreeUplinks(db, seed.uplinks);
  Store::Transaction transaction(db);
  Api::CreateDVSwitch(
      db, {seed.name, seed.portset.value_or(seed.name), id, Model::UuidOfName(seed.name),
           Model::kImplClasses[0], 0, seed.ports, seed.mtu});
  for (const auto& uplink : seed.uplinks) {
    const int64_t seq = Store::Meta::NextSeq(db);
    for (Layer layer : Store::kBothLayers) {
      Store::Distributed::AddUplink(db, layer, seed.name, {uplink, std::nullopt}, seq);
    }
  }
  transaction.Commit();
}

void RemoveDVSwitch(Store::Db& db, const std::string& name) {
  Scope scope(db, "RemoveDVSwitch");
  const auto row = Store::Distributed::Find(db, Layer::kRunning, name);
  if (!row) throw Refused("DVS " + name + " does not exist");
  Api::RemoveDVSwitch(db, name, row->portset);
}

std::vector<ListRow> ListDVSwitches(Store::Db& db) {
  std::vector<ListRow> rows;
  for (const auto& dvs : DVSwitches(db, Layer::kRunning)) {
    std::vector<std::string> pnics;
    for (const auto& uplink : dvs.uplinks) pnics.push_back(uplink.pnic);
    rows.push_back({dvs.name, dvs.row.portset, dvs.row.switchId, std::to_string(dvs.row.numPorts),
                    std::to_string(Store::Distributed::UsedPorts(db, dvs.name)), Join(pnics, ",")});
  }
  return rows;
}

std::string DVSwitchText(const DVSwitch& dvs) {
  const auto& row = dvs.row;
  std::string out = "  Distributed switch " + dvs.name + ": portset " + row.portset + ", id " +
                    row.switchId + ", " + std::to_string(row.numPorts) + " ports, MTU " +
                    std::to_string(row.mtu) + "\n";
  out += "    UUID " + row.uuid + ", class " + row.implClass + ", version " +
         std::to_string(row.version) + "\n";
  std::vector<std::string> uplinks;
  for (const auto& uplink : dvs.uplinks) {
    uplinks.push_back(uplink.pnic + (uplink.portId ? " (DVPort " + *uplink.portId + ")" : ""));
  }
  return out + "    Uplinks: " + Listed(uplinks) + "\n";
}

Json DVSwitchJson(const DVSwitch& dvs) {
  const auto& row = dvs.row;
  Json uplinks = Json::array();
  for (const auto& uplink : dvs.uplinks) {
    uplinks.push_back(
        {{"pnic", uplink.pnic}, {"dvport", uplink.portId ? Json(*uplink.portId) : Json(nullptr)}});
  }
  return {{"name", dvs.name},
          {"portset", row.portset},
          {"switchId", row.switchId},
          {"uuid", row.uuid},
          {"implClass", row.implClass},
          {"version", row.version},
          {"ports", row.numPorts},
          {"mtu", row.mtu},
          {"uplinks", std::move(uplinks)}};
}

}  // namespace TarnCtl::Admin
