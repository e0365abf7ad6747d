// Text helpers of the listing tables: list joining.
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

}  // namespace HostCtl::Misc
