// The text form of a distributed switch UUID: sixteen two-digit hex bytes
// separated by spaces, "-" after the eighth. One pattern serves writing and
// reading, for the tool's text helpers and the host library alike. When
// reading, each space matches any run of white space (or none) and each
// value skips white space before it; nothing may stand between the eighth
// value and the "-".
#pragma once

#include <cstdio>
#include <cstring>
#include <string>

#define HOSTCTL_UUID_PATTERN                                 \
  "%02hhx %02hhx %02hhx %02hhx %02hhx %02hhx %02hhx %02hhx-" \
  "%02hhx %02hhx %02hhx %02hhx %02hhx %02hhx %02hhx %02hhx"

namespace HostCtl::Text {

inline constexpr int kUuidBytes = 16;

// The UUID text of the first 15 bytes of `text`, zero-padded to 16: at most
// 15 characters fit before a terminating zero, so the last byte is always
// zero.
inline std::string UuidOfText(const char* text) {
  unsigned char b[kUuidBytes] = {};
  std::memcpy(b, text, strnlen(text, kUuidBytes - 1));
  char buffer[48];
  std::snprintf(buffer, sizeof buffer, HOSTCTL_UUID_PATTERN, b[0], b[1], b[2], b[3], b[4], b[5],
                b[6], b[7], b[8], b[9], b[10], b[11], b[12], b[13], b[14], b[15]);
  return buffer;
}

// How many of the sixteen values `text` holds, read by the pattern;
// `consumed` gets how many characters they took (-1 when not all 16 were
// read).
inline int ScanUuid(const char* text, int* consumed) {
  unsigned char b[kUuidBytes];
  *consumed = -1;
  return std::sscanf(text, HOSTCTL_UUID_PATTERN "%n", &b[0], &b[1], &b[2], &b[3], &b[4], &b[5],
                     &b[6], &b[7], &b[8], &b[9], &b[10], &b[11], &b[12], &b[13], &b[14], &b[15],
                     consumed);
}

// UuidOfText in a buffer of its own, which the next call overwrites (for
// callers that print C strings).
inline const char* UuidToString(const char* text) {
  static char buffer[48];
  std::snprintf(buffer, sizeof buffer, "%s", UuidOfText(text).c_str());
  return buffer;
}

// True when `text` scans as a UUID text (white space between bytes
// optional, none before the "-", trailing text ignored).
inline bool IsValidUuidString(const char* text) {
  int consumed = 0;
  return ScanUuid(text, &consumed) == kUuidBytes;
}

}  // namespace HostCtl::Text
