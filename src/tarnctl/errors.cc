#include "tarnctl/errors.h"

#include "tarnctl/call.h"

namespace TarnCtl::Detail {

using HostCtl::Lib::HostCtlException;

HostCtlException Refusal(const std::string& operation, const std::string& message,
                         const std::string& where) {
  return HostCtlException(message, operation + ": " + message + (where.empty() ? "" : " " + where));
}

HostCtlException Refused(const std::string& message, const std::string& where) {
  const char* operation = Call::Running();
  return Refusal(operation != nullptr ? operation : "HostCtl", message, where);
}

HostCtlException DatabaseError(const std::string& path, const std::string& cause) {
  const std::string message = "Host database " + path + ": " + cause;
  const char* operation = Call::Running();
  return HostCtlException(message,
                          operation != nullptr ? std::string(operation) + ": " + message : message);
}

}  // namespace TarnCtl::Detail
