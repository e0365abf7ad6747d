// The entry of every library operation: one trace line (trace.h), then the
// armed faults (faults.h).
//
//   Call call(session, "SetVlanId", On(name), FormatArgs(vlanId));
//
// The object lives for the operation; while it does, database errors name
// the operation in their detailed message.
#pragma once

#include <string>
#include <vector>

#include "tarnctl/trace.h"

namespace TarnCtl::Detail {

class Session;

// What a call acts on: `on` follows " on " in the trace line (empty: no
// " on"); `names` are what a fault's target may equal; `scope` precedes the
// operation's name in the trace line.
struct Target {
  std::string on;
  std::vector<std::string> names;
  std::string scope;
};

// A call of a static function or an information object with no name.
Target Nothing();
// A call on the object `name`.
Target On(const std::string& name);
// A call on a distributed switch: traced with its switch name, matched by
// its switch name or its portset name.
Target On(const std::string& switchName, const std::string& portsetName);
// A call that is given the name `argument` (a lookup, a static function,
// an information-object operation).
Target Named(const std::string& argument);
// A static function of the record class `record`: traced as
// "<record>::<operation>(...)", matched by the record's name.
Target Of(const std::string& record);

class Call {
 public:
  enum class OnFault { kThrow, kReport };

  // Traces the call and applies the faults armed on `session`'s host (none
  // when `session` is null). With kThrow a fault throws its
  // HostCtlException; with kReport it only sets failed().
  Call(Session* session, const char* operation, const Target& target, const std::string& args,
       OnFault onFault = OnFault::kThrow);
  ~Call();
  Call(const Call&) = delete;
  Call& operator=(const Call&) = delete;

  bool failed() const { return failed_; }
  // The innermost operation running, or nullptr.
  static const char* Running();

 private:
  const char* previous_;
  bool failed_ = false;
};

}  // namespace TarnCtl::Detail
