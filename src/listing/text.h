// Text helpers shared by the listing tables and the option checks: list
// joining and the text form of a distributed switch UUID.
#pragma once

#include <sstream>
#include <string>
#include <vector>

namespace HostCtl::Misc {

// Joins `items` with `separator` between them (never after the last one).
// A null separator fails the stream at the first separator, leaving the
// first item alone.
template <typename T>
std::string VectorToString(const std::vector<T>& items, const char* separator) {
  std::ostringstream out;
  for (size_t i = 0; i < items.size(); ++i) {
    if (i > 0) out << separator;
    out << items[i];
  }
  return out.str();
}

// The UUID text of the first 15 bytes of `text`, zero-padded to 16: sixteen
// two-digit hex bytes separated by spaces, with "-" after the eighth. The
// result lives in a static buffer that the next call overwrites.
const char* UuidToString(const char* text);

// True when `text` scans as a UUID text (sscanf rules: white space between
// bytes optional, none before the "-", trailing text ignored).
bool IsValidUuidString(const char* text);

}  // namespace HostCtl::Misc
