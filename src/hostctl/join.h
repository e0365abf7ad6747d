// Lists as text, for the tool and the host alike: items with a separator
// between each two, and "a, b or c" for alternatives.
#pragma once

#include <initializer_list>
#include <iterator>
#include <string>
#include <string_view>

namespace HostCtl::Text {

// `items` (texts) with `separator` between each two, none before the first
// or after the last; `last` goes between the last two instead. A braced
// list of texts may stand for `items`.
template <typename Items = std::initializer_list<std::string_view>>
std::string Join(const Items& items, std::string_view separator, std::string_view last) {
  const size_t count = std::size(items);
  std::string text;
  size_t i = 0;
  for (const auto& item : items) {
    if (i > 0) text += i + 1 == count ? last : separator;
    text += item;
    ++i;
  }
  return text;
}

template <typename Items = std::initializer_list<std::string_view>>
std::string Join(const Items& items, std::string_view separator) {
  return Join(items, separator, separator);
}

}  // namespace HostCtl::Text
