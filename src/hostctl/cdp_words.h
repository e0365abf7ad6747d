// The words of the CDP statuses 0 to 3, as the tool prints and reads them
// and the host's administration shows them.
#pragma once

#include <array>
#include <cstdint>
#include <string>

namespace HostCtl::Text {

inline constexpr std::array<const char*, 4> kCdpWords = {"down", "listen", "advertise", "both"};

// The word of a status; a status outside 0..3 as its number.
inline std::string CdpWord(int64_t status) {
  return status >= 0 && status < static_cast<int64_t>(kCdpWords.size()) ? kCdpWords[status]
                                                                        : std::to_string(status);
}

}  // namespace HostCtl::Text
