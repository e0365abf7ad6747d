#include "tarnctl/admin/opaque.h"

#include "tarnctl/admin/pnic.h"
#include "tarnctl/instrument/call.h"
#include "tarnctl/instrument/errors.h"
#include "tarnctl/model/limits.h"
#include "tarnctl/model/names.h"
#include "tarnctl/store/meta.h"
#include "tarnctl/store/transaction.h"

namespace TarnCtl::Admin {

using Instrument::Refused;
using Instrument::Scope;

std::vector<OpaqueSwitch> OpaqueSwitches(Store::Db& db) {
  return Store::Opaque::List(db);
}

std::optional<OpaqueSwitch> FindOpaqueSwitch(Store::Db& db, const std::string& name) {
  if (auto row = Store::Opaque::Find(db, name)) return OpaqueSwitch{name, std::move(*row)};
  return std::nullopt;
}

void AddOpaqueSwitch(Store::Db& db, const OpaqueSeed& seed) {
  Scope scope(db, "AddOpaqueSwitch");
  const std::string portset = seed.portset.value_or(seed.name);
  Model::CheckNewSwitchName(db, Model::NameKind::kSwitch, seed.name);
  if (portset != seed.name) Model::CheckNewSwitchName(db, Model::NameKind::kPortset, portset);
  Model::Check(Model::kPorts, seed.ports);
  Model::Check(Model::kUsedPorts, seed.used, seed.ports);
  CheckFreeUplinks(db, seed.uplinks);
  Store::Transaction transaction(db);
  Store::Opaque::Insert(
      db, seed.name, Store::Meta::NextSeq(db),
      {portset, static_cast<uint32_t>(seed.ports), static_cast<uint32_t>(seed.used), seed.uplinks});
  transaction.Commit();
}

void RemoveOpaqueSwitch(Store::Db& db, const std::string& name) {
  Scope scope(db, "RemoveOpaqueSwitch");
  if (!Store::Opaque::Find(db, name)) throw Refused("Opaque switch " + name + " does not exist");
  Store::Transaction transaction(db);
  Store::Opaque::Delete(db, name);
  transaction.Commit();
}

std::vector<ListRow> ListOpaqueSwitches(Store::Db& db) {
  std::vector<ListRow> rows;
  for (const auto& sw : OpaqueSwitches(db)) {
    rows.push_back({sw.name, sw.row.portset, std::to_string(sw.row.numPorts),
                    std::to_string(sw.row.usedPorts), Join(sw.row.uplinks, ",")});
  }
  return rows;
}

std::string OpaqueSwitchText(const OpaqueSwitch& sw) {
  return sw.name + ": portset " + sw.row.portset + ", " + std::to_string(sw.row.numPorts) +
         " ports, " + std::to_string(sw.row.usedPorts) + " used, uplinks " + Listed(sw.row.uplinks);
}

Json OpaqueSwitchJson(const OpaqueSwitch& sw) {
  return {{"name", sw.name},
          {"portset", sw.row.portset},
          {"ports", sw.row.numPorts},
          {"usedPorts", sw.row.usedPorts},
          {"uplinks", sw.row.uplinks}};
}

}  // namespace TarnCtl::Admin
