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
  if (TraceJson()) {
    recorded_ = true;
    target_ = target;
    args_ = args;
    errorsMade_ = Store::LastErrorMade().count;
  } else if (TraceOn()) {
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
    if (auto fired = TakeFault(*db_, g_running, target.names)) {
      fault_ = fired->number;
      if (fired->failure && onFault == OnFault::kThrow) {
        Record(CallOutcome::Kind::kFault, &fired->failure->GetMessage());
        throw *fired->failure;
      }
      failed_ = fired->failure.has_value();
      if (failed_ && recorded_) faultMessage_ = fired->failure->GetMessage();
    }
    if (operation.access == kChanges) savepoint_.emplace(*db_);
    changes_ = db_->ChangeCount();
    reads_ = operation.access != kChanges;
  } catch (...) {
    Record(CallOutcome::Kind::kRefused);
    Leave();
    throw;
  }
}

Call::~Call() noexcept(false) {
  // The registry must say which operations change the host: only those are
  // undone whole.
  assert(db_ == nullptr || !reads_ || db_->ChangeCount() == changes_);
  const bool returns = std::uncaught_exceptions() == uncaught_;
  try {
    if (savepoint_ && returns) savepoint_->Commit();
  } catch (...) {
    savepoint_.reset();
    Record(CallOutcome::Kind::kRefused);
    Leave();
    throw;
  }
  savepoint_.reset();
  if (!returns) {
    Record(CallOutcome::Kind::kRefused);
  } else {
    Record(failed_ ? CallOutcome::Kind::kFault : CallOutcome::Kind::kOk);
  }
  Leave();
}

void Call::Record(CallOutcome::Kind kind, const std::string* message) {
  if (!recorded_) return;
  recorded_ = false;
  const Store::ErrorMade& made = Store::LastErrorMade();
  // A refusal's message is the last one the library made during the call.
  if (kind == CallOutcome::Kind::kRefused && message == nullptr && made.count != errorsMade_) {
    message = &made.message;
  }
  if (kind == CallOutcome::Kind::kFault && message == nullptr) message = &faultMessage_;
  TraceCallRecord(target_.record, g_running, args_, target_.on, {kind, message, fault_});
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
