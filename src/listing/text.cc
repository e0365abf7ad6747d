// The UUID text helpers of the tool, over the one UUID text form.
#include "listing/text.h"

#include <cstdio>
#include <string>

#include "hostctl/uuid_text.h"

namespace HostCtl::Misc {

const char* UuidToString(const char* text) {
  static char buffer[48];
  std::snprintf(buffer, sizeof buffer, "%s", HostCtl::Text::UuidOfText(text).c_str());
  return buffer;
}

bool IsValidUuidString(const char* text) {
  int consumed = 0;
  return HostCtl::Text::ScanUuid(text, &consumed) == HostCtl::Text::kUuidBytes;
}

}  // namespace HostCtl::Misc
