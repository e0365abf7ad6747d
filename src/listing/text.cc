// The UUID text form: sixteen two-digit hex bytes, "-" after the eighth.
#include "listing/text.h"

#include <cstdio>

namespace HostCtl::Misc {
namespace {

// One pattern for writing and reading. When reading, each space matches any
// run of white space (or none) and each value skips white space before it;
// nothing may stand between the eighth value and the "-".
constexpr const char kUuidPattern[] =
    "%02hhx %02hhx %02hhx %02hhx %02hhx %02hhx %02hhx %02hhx-"
    "%02hhx %02hhx %02hhx %02hhx %02hhx %02hhx %02hhx %02hhx";

constexpr int kUuidBytes = 16;

}  // namespace

const char* UuidToString(const char* text) {
  static char buffer[48];
  // At most 15 characters fit before the terminating zero, so the last byte
  // of the value is always zero.
  unsigned char bytes[kUuidBytes] = {};
  std::snprintf(reinterpret_cast<char*>(bytes), sizeof bytes, "%s", text);
  std::snprintf(buffer, sizeof buffer, kUuidPattern, bytes[0], bytes[1], bytes[2], bytes[3],
                bytes[4], bytes[5], bytes[6], bytes[7], bytes[8], bytes[9], bytes[10], bytes[11],
                bytes[12], bytes[13], bytes[14], bytes[15]);
  return buffer;
}

bool IsValidUuidString(const char* text) {
  unsigned char b[kUuidBytes];
  return std::sscanf(text, kUuidPattern, &b[0], &b[1], &b[2], &b[3], &b[4], &b[5], &b[6], &b[7],
                     &b[8], &b[9], &b[10], &b[11], &b[12], &b[13], &b[14], &b[15]) == kUuidBytes;
}

}  // namespace HostCtl::Misc
