// The administration host object: opening, replacing and rebooting the
// host, and the faults armed on it.
#include <string>

#include "tarnctl/admin/host.h"
#include "tarnctl/admin/state.h"
#include "tarnctl/instrument/call.h"
#include "tarnctl/instrument/errors.h"
#include "tarnctl/instrument/operations.h"
#include "tarnctl/model/limits.h"
#include "tarnctl/model/names.h"
#include "tarnctl/store/db.h"
#include "tarnctl/store/faults.h"
#include "tarnctl/store/host_file.h"
#include "tarnctl/store/reset.h"
#include "tarnctl/store/transaction.h"

namespace TarnCtl::Admin {

using Instrument::Refused;
using Instrument::Scope;
using Store::Transaction;

std::string Reason(const HostCtl::Lib::HostCtlException& failure) {
  if (const auto* refusal = dynamic_cast<const Instrument::Refusal*>(&failure)) {
    return refusal->explanation();
  }
  // A database's failure names the file in its message; the operation that
  // ran adds nothing for people.
  if (dynamic_cast<const Store::DbError*>(&failure) != nullptr) return failure.GetMessage();
  const std::string detail = failure.GetDetailedMessage();
  return detail.empty() ? failure.GetMessage() : detail;
}

std::string HostPath() {
  return Api::Session::DefaultLocation().path;
}

std::string WaitingLog(const std::string& path) {
  return Store::WaitingLog(path);
}

std::vector<OperationInfo> LibraryOperations() {
  std::vector<OperationInfo> operations;
  for (const auto& operation : Instrument::Operations()) {
    operations.push_back(
        {operation.name, Instrument::TargetText(operation.targets), operation.faultable});
  }
  return operations;
}

Host::Host() : state_(std::make_unique<State>(State{Api::Session::Acquire()})) {}

Host::Host(std::unique_ptr<State> state) : state_(std::move(state)) {}

Host::~Host() = default;

const std::string& Host::Path() const {
  return state_->session->path();
}

void Host::Commit() {
  state_->session->Commit();
}

void Host::Init(bool empty) {
  Store::Db& db = state_->db();
  Scope scope(db, "Init");
  Transaction transaction(db);
  Store::Reset::Rebuild(db, empty);
  transaction.Commit();
}

void Host::Reboot() {
  Store::Db& db = state_->db();
  Scope scope(db, "Reboot");
  Transaction transaction(db);
  Store::Reset::Reboot(db);
  transaction.Commit();
}

void Host::AddFault(const FaultSeed& seed) {
  Store::Db& db = state_->db();
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
  Transaction transaction(db);
  Store::Faults::Insert(
      db, {0, seed.operation, seed.on, seed.message.value_or("injected fault"),
           seed.detail.value_or("injected fault in " + seed.operation), seed.skip, seed.times});
  transaction.Commit();
}

void Host::RemoveFault(int64_t number) {
  Store::Db& db = state_->db();
  Scope scope(db, "RemoveFault");
  Transaction transaction(db);
  if (!Store::Faults::Delete(db, number)) {
    throw Refused("Fault " + std::to_string(number) + " does not exist",
                  "(tarnhost fault list numbers the armed ones)");
  }
  transaction.Commit();
}

void Host::ClearFaults() {
  Store::Db& db = state_->db();
  Scope scope(db, "ClearFaults");
  Transaction transaction(db);
  Store::Faults::Clear(db);
  transaction.Commit();
}

}  // namespace TarnCtl::Admin
