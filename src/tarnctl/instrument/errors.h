// How the library words its refusals.
//
// A refusal (a name taken, a value out of range, an unknown object) is a
// HostCtlException whose message is a short sentence saying what and why
// ("Portgroup pg1 already exists"), and whose detailed message starts with
// the name of the operation that is running and adds where or why
// ("AddPortGroup: Portgroup pg1 already exists on this host"). Refusals
// never name the database file; database failures do (store/db.h).
#pragma once

#include <string>

#include "hostctl/exception.h"
#include "tarnctl/store/errors_made.h"

namespace TarnCtl::Instrument {

// A refusal, with the parts of its detailed message: the operation's name
// (empty when none leads it) and the explanation that follows it, which
// is the refusal as people read it.
class Refusal : public HostCtl::Lib::HostCtlException {
 public:
  Refusal(const std::string& operation, const std::string& message, const std::string& explanation)
      : HostCtlException(message, operation.empty() ? explanation : operation + ": " + explanation),
        operation_(operation),
        explanation_(explanation) {
    Store::NoteErrorMade(message);
  }
  const std::string& operation() const { return operation_; }
  const std::string& explanation() const { return explanation_; }

 private:
  std::string operation_;
  std::string explanation_;
};

// A refusal of the operation that is running (Call or Scope): message
// `message`, detailed message "<operation>: <message>" followed by
// " <where>" when `where` is not empty.
Refusal Refused(const std::string& message, const std::string& where = "");

}  // namespace TarnCtl::Instrument
