#include "tarnctl/instrument/call.h"

#include <cassert>
#include <exception>

#include "tarnctl/instrument/faults.h"
#include "tarnctl/store/db.h"

namespace TarnCtl::Instrument {

namespace {
const char* g_running = nullptr;
}  // namespace

Target Nothing() {
  return {};
}

Target On(const std::string& name) {
  return {name, {name, {}}, {}};
}

Target On(const std::string& switchName, const std::string& portsetName) {
  return {switchName, {switchName, portsetName}, {}};
}

Target Named(const std::string& argument) {
  return {{}, {argument, {}}, {}};
}

Target Of(const char* record) {
  return {{}, {record, {}}, record};
}

Call::Call(Store::Db* db, Op op, const Target& target, const std::string& args, OnFault onFault)
    : db_(db), previous_(g_running), uncaught_(std::uncaught_exceptions()) {
  const Operation& operation = Describe(op);
  g_running = operation.name;
  if (db_ != nullptr) {
    previousContext_ = db_->context();
    db_->set_context(g_running);
  }
  if (TraceOn()) {
    std::string line;
    if (!target.record.empty()) line.append(target.record).append("::");
    line.append(operation.name).append(1, '(').append(args).append(1, ')');
    if (!target.on.empty()) {
      line += " on ";
      AppendEscaped(line, std::string(target.on));
    }
    WriteTraceLine(line);
  }
  if (db_ == nullptr) return;
  try {
    // A fault is used up even when it makes the operation fail: it is taken
    // before the savepoint that a failure undoes.
    if (auto fired = TakeFault(*db_, g_running, target.names); fired && fired->failure) {
      if (onFault == OnFault::kThrow) throw *fired->failure;
      failed_ = true;
    }
    if (operation.access == kChanges) savepoint_.emplace(*db_);
    changes_ = db_->ChangeCount();
    reads_ = operation.access != kChanges;
  } catch (...) {
    Leave();
    throw;
  }
}

Call::~Call() noexcept(false) {
  // The registry must say which operations change the host: only those are
  // undone whole.
  assert(db_ == nullptr || !reads_ || db_->ChangeCount() == changes_);
  try {
    if (savepoint_ && std::uncaught_exceptions() == uncaught_) savepoint_->Commit();
  } catch (...) {
    savepoint_.reset();
    Leave();
    throw;
  }
  savepoint_.reset();
  Leave();
}

void Call::Leave() {
  if (db_ != nullptr) db_->set_context(previousContext_);
  g_running = previous_;
}

const char* Call::Running() {
  return g_running;
}

Scope::Scope(Store::Db& db, const char* name)
    : db_(db), previous_(g_running), previousContext_(db.context()) {
  g_running = name;
  db_.set_context(name);
}

Scope::~Scope() {
  db_.set_context(previousContext_);
  g_running = previous_;
}

}  // namespace TarnCtl::Instrument
