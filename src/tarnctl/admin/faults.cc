#include "tarnctl/admin/faults.h"

#include "tarnctl/instrument/call.h"
#include "tarnctl/instrument/errors.h"
#include "tarnctl/instrument/operations.h"
#include "tarnctl/instrument/trace.h"
#include "tarnctl/model/limits.h"
#include "tarnctl/model/names.h"
#include "tarnctl/store/transaction.h"

namespace TarnCtl::Admin {
namespace {

using Instrument::Refused;
using Instrument::Scope;

std::string Quoted(const std::string& text) {
  std::string quoted;
  Instrument::AppendArg(quoted, text);
  return quoted;
}

}  // namespace

std::vector<OperationInfo> LibraryOperations() {
  std::vector<OperationInfo> operations;
  for (const auto& operation : Instrument::Operations()) {
    operations.push_back(
        {operation.name, Instrument::TargetText(operation.targets), operation.faultable});
  }
  return operations;
}

std::vector<Fault> Faults(Store::Db& db) {
  return Store::Faults::List(db);
}

void AddFault(Store::Db& db, const FaultSeed& seed) {
  Scope scope(db, "AddFault");
  if (seed.operation.empty()) throw Refused("Fault operation is empty");
  const Instrument::Operation* operation = Instrument::FindOperation(seed.operation);
  if (operation == nullptr) {
    const auto nearest = Instrument::NearestOperation(seed.operation);
    throw Refused("Unknown operation " + seed.operation,
                  nearest ? "(did you mean " + *nearest + "?)" : "(tarnhost fault ops lists them)");
  }
  if (!operation->faultable) {
    throw Refused("Operation " + seed.operation + " cannot be made to fail",
                  "(it runs without the host)");
  }
  if (seed.on) Model::CheckName(Model::NameKind::kFaultTarget, *seed.on);
  Model::Check(Model::kFaultSkip, seed.skip);
  Model::Check(Model::kFaultTimes, seed.times);
  Store::Transaction transaction(db);
  Store::Faults::Insert(
      db,
      {0, seed.operation, seed.on, seed.message.value_or(Store::Faults::kDefaultMessage),
       seed.detail.value_or(Store::Faults::DefaultDetail(seed.operation)), seed.skip, seed.times});
  transaction.Commit();
}

void RemoveFault(Store::Db& db, int64_t number) {
  Scope scope(db, "RemoveFault");
  Store::Transaction transaction(db);
  if (!Store::Faults::Delete(db, number)) {
    throw Refused("Fault " + std::to_string(number) + " does not exist",
                  "(tarnhost fault list numbers the armed ones)");
  }
  transaction.Commit();
}

void ClearFaults(Store::Db& db) {
  Scope scope(db, "ClearFaults");
  Store::Transaction transaction(db);
  Store::Faults::Clear(db);
  transaction.Commit();
}

std::vector<ListRow> ListFaults(Store::Db& db) {
  std::vector<ListRow> rows;
  for (const auto& fault : Faults(db)) {
    rows.push_back({std::to_string(fault.id), fault.operation, fault.target.value_or(""),
                    std::to_string(fault.skip), std::to_string(fault.times), Quoted(fault.message),
                    Quoted(fault.detail)});
  }
  return rows;
}

std::string FaultText(const Fault& fault) {
  return fault.operation + (fault.target ? " on " + *fault.target : "") + ": lets " +
         std::to_string(fault.skip) + " pass, then fails " + std::to_string(fault.times) +
         "; message " + Quoted(fault.message) + ", detail " + Quoted(fault.detail);
}

Json FaultJson(const Fault& fault) {
  return {{"operation", fault.operation},
          {"on", fault.target ? TextJson(*fault.target) : Json(nullptr)},
          {"message", TextJson(fault.message)},
          {"detail", TextJson(fault.detail)},
          {"skip", fault.skip},
          {"times", fault.times}};
}

}  // namespace TarnCtl::Admin
