// How far a mistyped word is from a known one, for "did you mean": the host
// suggests operation names by it, tarnhost its command words and options.
#pragma once

#include <algorithm>
#include <cctype>
#include <string_view>
#include <vector>

namespace HostCtl::Text {

// The edits that turn `a` into `b`, counted in halves: an insertion, a
// deletion, a substitution or a swap of two neighbours is 2, a change of
// case alone 1 (a name in the wrong case is nearer than one with another
// letter).
inline size_t EditDistance(std::string_view a, std::string_view b) {
  const auto substitution = [](char x, char y) -> size_t {
    if (x == y) return 0;
    return std::tolower(static_cast<unsigned char>(x)) ==
                   std::tolower(static_cast<unsigned char>(y))
               ? 1
               : 2;
  };
  std::vector<std::vector<size_t>> d(a.size() + 1, std::vector<size_t>(b.size() + 1));
  for (size_t i = 0; i <= a.size(); ++i) d[i][0] = 2 * i;
  for (size_t j = 0; j <= b.size(); ++j) d[0][j] = 2 * j;
  for (size_t i = 1; i <= a.size(); ++i) {
    for (size_t j = 1; j <= b.size(); ++j) {
      d[i][j] = std::min(
          {d[i - 1][j] + 2, d[i][j - 1] + 2, d[i - 1][j - 1] + substitution(a[i - 1], b[j - 1])});
      if (i > 1 && j > 1 && a[i - 1] == b[j - 2] && a[i - 2] == b[j - 1]) {
        d[i][j] = std::min(d[i][j], d[i - 2][j - 2] + 2);
      }
    }
  }
  return d[a.size()][b.size()];
}

}  // namespace HostCtl::Text
