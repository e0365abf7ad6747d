// The entry of every library operation: one trace line (trace.h), then the
// armed faults (faults.h), then, for an operation that may change the host
// (operations.h), a savepoint: everything it changes is kept when it returns
// and undone when it throws.
//
//   TARN_CALL(db, SetVlanId, On(name), vlanId);
//
// declares the Call object `tarn_call_` for the rest of the scope, naming
// the operation from the registry (operations.h); it does not compile
// unless the operation is the function it is written in. The arguments
// are formatted only when the trace is on. While the object lives,
// database errors and refusals (errors.h) name the operation.
#pragma once

#include <array>
#include <optional>
#include <source_location>
#include <string>
#include <string_view>
#include <vector>

#include "tarnctl/instrument/operations.h"
#include "tarnctl/instrument/trace.h"
#include "tarnctl/store/transaction.h"

namespace TarnCtl::Instrument {

// What a call acts on: `on` follows " on " in the trace line (empty: no
// " on"); `names` are what a fault's target may equal (unused ones empty);
// `record` and "::" precede the operation's name in the trace line. The
// texts are not owned: they outlive the call (the object's or the
// caller's).
struct Target {
  std::string_view on;
  std::array<std::string_view, 2> names;
  std::string_view record;
};

// A call of a static function or an information object with no name.
Target Nothing();
// A call on the object `name`.
Target On(const std::string& name);
// A call on a distributed or opaque switch: traced with its switch name,
// matched by its switch name or its portset name.
Target On(const std::string& switchName, const std::string& portsetName);
// A call that is given the name `argument` (a lookup, a static function,
// an information-object operation).
Target Named(const std::string& argument);
// A static function of the record class `record`: traced as
// "<record>::<operation>(...)", matched by the record's name.
Target Of(const char* record);

class Call {
 public:
  enum class OnFault { kThrow, kReport };

  // Traces the call (when the trace is on, with the text `args()` returns)
  // and applies the faults armed on `db`'s host (none when `db` is null).
  // With kThrow a fault throws its HostCtlException; with kReport it only
  // sets failed(). Then opens the savepoint of an operation that changes
  // the host.
  template <typename Args>
  Call(Store::Db* db, Op op, const Target& target, Args args, OnFault onFault = OnFault::kThrow)
      : Call(db, op, target, TraceOn() ? args() : std::string(), onFault) {}
  // Commits the savepoint when the operation returns, which throws what a
  // failed commit met; undoes it when the operation throws.
  ~Call() noexcept(false);
  Call(const Call&) = delete;
  Call& operator=(const Call&) = delete;

  bool failed() const { return failed_; }
  // The innermost operation running, or nullptr.
  static const char* Running();

 private:
  Call(Store::Db* db, Op op, const Target& target, const std::string& args, OnFault onFault);
  void Leave();
  // The JSON trace's record of the call, as it ends.
  void Record(CallOutcome::Kind kind, const std::string* message = nullptr);

  Store::Db* db_;
  const char* previous_;
  const char* previousContext_ = nullptr;
  bool failed_ = false;
  int uncaught_;  // exceptions in flight when the call began
  bool reads_ = false;
  int64_t changes_ = 0;  // the connection's changes when the operation began
  std::optional<Store::Transaction> savepoint_;
  // For the JSON trace's record (json_trace.cc), when it is on.
  bool recorded_ = false;
  Target target_;
  std::string args_;
  int64_t fault_ = 0;         // the number of the fault that fired on it
  std::string faultMessage_;  // what it said, when the call reports it
  uint64_t errorsMade_ = 0;   // exceptions made in the process when it began
};

// An administration step that is not a library operation (tarnhost's
// commands): no trace line and no faults, but refusals and database errors
// name `name` while it lives.
class Scope {
 public:
  Scope(Store::Db& db, const char* name);
  ~Scope();
  Scope(const Scope&) = delete;
  Scope& operator=(const Scope&) = delete;

 private:
  Store::Db& db_;
  const char* previous_;
  const char* previousContext_;
};

// True when `function` (a function's name as the compiler writes it) is the
// function `operation`, a constructor of that class included. Compilers
// differ in what they write before the name: a qualifier ("X::"), or the
// return type, with or without a space ("char *f(...)", "char* f(...)").
constexpr bool IsFunction(std::string_view function, std::string_view operation) {
  for (size_t at = function.find(operation); at != std::string_view::npos;
       at = function.find(operation, at + 1)) {
    const bool start =
        at == 0 || std::string_view(": *&").find(function[at - 1]) != std::string_view::npos;
    const size_t end = at + operation.size();
    if (start && end < function.size() && function[end] == '(') return true;
  }
  return false;
}

}  // namespace TarnCtl::Instrument

// The registered operation `op`; does not compile for an unknown one.
#define TARN_OPERATION(op)                                            \
  [] {                                                                \
    constexpr int index = ::TarnCtl::Instrument::OperationIndex(#op); \
    static_assert(index >= 0, "operation " #op " is not registered"); \
    return static_cast<::TarnCtl::Instrument::Op>(index);             \
  }()

#define TARN_CHECK_OPERATION(op)                                                               \
  static_assert(                                                                               \
      ::TarnCtl::Instrument::IsFunction(std::source_location::current().function_name(), #op), \
      "operation " #op " is not the function it is written in")

#define TARN_CALL(db, op, target, ...)                                             \
  TARN_CHECK_OPERATION(op);                                                        \
  ::TarnCtl::Instrument::Call tarn_call_((db), TARN_OPERATION(op), (target), [&] { \
    return ::TarnCtl::Instrument::FormatArgs(__VA_ARGS__);                         \
  })

// The same for calls that must not throw: a fault only sets
// tarn_call_.failed().
#define TARN_CALL_REPORTING(db, op, target, ...)                      \
  TARN_CHECK_OPERATION(op);                                           \
  ::TarnCtl::Instrument::Call tarn_call_(                             \
      (db), TARN_OPERATION(op), (target),                             \
      [&] { return ::TarnCtl::Instrument::FormatArgs(__VA_ARGS__); }, \
      ::TarnCtl::Instrument::Call::OnFault::kReport)

// The entry of an operation on an object whose state `state` has db() and
// CallTarget().
#define TARN_CALL_ON(state, op, ...) TARN_CALL(&(state).db(), op, (state).CallTarget(), __VA_ARGS__)
