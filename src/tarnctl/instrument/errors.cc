#include "tarnctl/instrument/errors.h"

#include "tarnctl/instrument/call.h"

namespace TarnCtl::Instrument {

HostCtl::Lib::HostCtlException Refused(const std::string& message, const std::string& where) {
  const char* operation = Call::Running();
  return HostCtl::Lib::HostCtlException(
      message, std::string(operation != nullptr ? operation : "HostCtl") + ": " + message +
                   (where.empty() ? "" : " " + where));
}

}  // namespace TarnCtl::Instrument
