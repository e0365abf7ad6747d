#include "tarnctl/admin/faults.h"

#include <type_traits>

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

// What a fault does now: "armed", or "spent" once it has done all it was
// armed for.
const char* State(const Fault& fault) {
  return Store::Faults::Spent(fault) ? "spent" : "armed";
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
  Model::Check(Model::kFaultDelay, seed.delayMs);
  Store::Transaction transaction(db);
  Store::Faults::Insert(
      db, {0, seed.operation, seed.on, seed.message.value_or(Store::Faults::kDefaultMessage),
           seed.detail.value_or(Store::Faults::DefaultDetail(seed.operation)), seed.skip,
           seed.times, seed.delayMs, seed.pass, seed.always, 0});
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

std::vector<ListRow> ListFaults(Store::Db& db, bool armedOnly) {
  std::vector<ListRow> rows;
  for (const auto& fault : Faults(db)) {
    if (armedOnly && Store::Faults::Spent(fault)) continue;
    ListRow row(Store::Faults::kFieldCount);
    Store::Faults::VisitFields(fault, [&](const Store::Faults::Field& field, const auto& value) {
      using T = std::remove_cvref_t<decltype(value)>;
      std::string& text = row[field.listed];
      if constexpr (std::is_same_v<T, bool>) {
        text = value ? field.key : "";
      } else if constexpr (std::is_same_v<T, std::string>) {
        text = field.value == Store::Faults::Value::kText ? Quoted(value) : value;
      } else if constexpr (std::is_same_v<T, std::optional<std::string>>) {
        text = value.value_or("");
      } else {
        text = std::to_string(value);
      }
    });
    row.push_back(State(fault));
    rows.push_back(std::move(row));
  }
  return rows;
}

std::string FaultText(const Fault& fault) {
  std::string text = fault.operation + (fault.target ? " on " + *fault.target : "") + ": lets " +
                     std::to_string(fault.skip) + " pass, then " +
                     (fault.pass ? "slows " : "fails ") +
                     (fault.always ? "every call" : std::to_string(fault.times));
  if (fault.delayMs > 0) text += " by " + std::to_string(fault.delayMs) + " ms";
  text += "; message " + Quoted(fault.message) + ", detail " + Quoted(fault.detail);
  if (fault.fired > 0) text += "; fired " + std::to_string(fault.fired);
  if (Store::Faults::Spent(fault)) text += "; spent";
  return text;
}

Json FaultJson(const Fault& fault) {
  Json json = Json::object();
  Store::Faults::VisitFields(fault, [&](const Store::Faults::Field& field, const auto& value) {
    using T = std::remove_cvref_t<decltype(value)>;
    if constexpr (std::is_same_v<T, std::string>) {
      json[field.key] = TextJson(value);
    } else if constexpr (std::is_same_v<T, std::optional<std::string>>) {
      json[field.key] = value ? TextJson(*value) : Json(nullptr);
    } else {
      json[field.key] = value;
    }
  });
  json["state"] = State(fault);
  return json;
}

}  // namespace TarnCtl::Admin
