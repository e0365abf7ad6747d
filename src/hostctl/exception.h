// The one exception type of the host control library.
//
// Every operation of the HostCtl and TarnCtl classes reports failure by
// throwing HostCtlException and by no other means. The message is the short
// text that callers append to their own error lines; the detailed message is
// the longer text printed alone when nobody handled the failure.
#pragma once

#include <exception>
#include <string>
#include <utility>

namespace HostCtl::Lib {

class HostCtlException : public std::exception {
 public:
  HostCtlException(std::string message, std::string detailedMessage)
      : message_(std::move(message)), detailedMessage_(std::move(detailedMessage)) {}

  const std::string& GetMessage() const { return message_; }
  std::string GetDetailedMessage() const { return detailedMessage_; }
  const char* what() const noexcept override { return message_.c_str(); }

 private:
  std::string message_;
  std::string detailedMessage_;
};

}  // namespace HostCtl::Lib
