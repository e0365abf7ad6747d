#include "tarnctl/admin/pnic.h"

#include <set>

#include "tarnctl/instrument/call.h"
#include "tarnctl/instrument/errors.h"
#include "tarnctl/model/names.h"
#include "tarnctl/store/meta.h"
#include "tarnctl/store/pnics.h"
#include "tarnctl/store/transaction.h"

namespace TarnCtl::Admin {

using Instrument::Refused;
using Instrument::Scope;

std::vector<Pnic> Pnics(Store::Db& db) {
  std::vector<Pnic> pnics;
  for (auto& name : Store::Pnics::Names(db)) {
    // Which switch uses a pnic is the model's rule, the one that refuses a
    // pnic to another switch.
    pnics.push_back({name, Model::PnicOwner(db, name).value_or(""),
                     Store::Pnics::LinkedSwitch(db, Store::Layer::kStored, name).value_or("")});
  }
  return pnics;
}

std::vector<std::string> PnicNames(Store::Db& db) {
  return Store::Pnics::Names(db);
}

void AddPnic(Store::Db& db, const std::string& name) {
  Scope scope(db, "AddPnic");
  Model::CheckName(Model::NameKind::kPnic, name);
  if (Store::Pnics::Exists(db, name)) throw Refused("Pnic " + name + " already exists");
  Store::Transaction transaction(db);
  Store::Pnics::Insert(db, name, Store::Meta::NextSeq(db));
  transaction.Commit();
}

void RemovePnic(Store::Db& db, const std::string& name) {
  Scope scope(db, "RemovePnic");
  Model::CheckRemovablePnic(db, name);
  Store::Transaction transaction(db);
  Store::Pnics::Delete(db, name);
  transaction.Commit();
}

void CheckFreeUplinks(Store::Db& db, const std::vector<std::string>& uplinks) {
  std::set<std::string> seen;
  for (const auto& uplink : uplinks) {
    if (!seen.insert(uplink).second) throw Refused("Uplink " + uplink + " is given twice");
    Model::CheckFreePnic(db, uplink);
  }
}

std::vector<ListRow> ListPnics(Store::Db& db) {
  std::vector<ListRow> rows;
  for (auto& pnic : Pnics(db)) rows.push_back({pnic.name, pnic.user, pnic.linked});
  return rows;
}

}  // namespace TarnCtl::Admin
