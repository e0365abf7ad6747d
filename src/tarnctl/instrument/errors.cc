#include "tarnctl/instrument/errors.h"

#include "tarnctl/instrument/call.h"

namespace TarnCtl::Instrument {

Refusal Refused(const std::string& message, const std::string& where) {
  const char* operation = Call::Running();
  return Refusal(operation != nullptr ? operation : "HostCtl", message,
                 where.empty() ? message : message + " " + where);
}

}  // namespace TarnCtl::Instrument
