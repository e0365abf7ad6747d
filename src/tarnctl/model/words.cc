#include "tarnctl/model/words.h"

#include <algorithm>

#include "hostctl/join.h"
#include "hostctl/uuid_text.h"
#include "tarnctl/instrument/errors.h"

namespace TarnCtl::Model {

int32_t CdpStatusOfWord(const std::string& word) {
  for (size_t i = 0; i < kCdpWords.size(); ++i) {
    if (word == kCdpWords[i]) return static_cast<int32_t>(i);
  }
  throw Instrument::Refused("Unknown CDP status " + word,
                            "(expected " + HostCtl::Text::Join(kCdpWords, ", ", " or ") + ")");
}

bool IsUuidText(const std::string& text) {
  int consumed = 0;
  return HostCtl::Text::ScanUuid(text.c_str(), &consumed) == HostCtl::Text::kUuidBytes &&
         consumed == static_cast<int>(text.size());
}

void CheckUuid(const std::string& text) {
  if (!IsUuidText(text)) {
    throw Instrument::Refused(
        "Invalid UUID " + text,
        "(expected xx xx xx xx xx xx xx xx-xx xx xx xx xx xx xx xx in hexadecimal)");
  }
}

std::string UuidOfName(const std::string& name) {
  return HostCtl::Text::UuidOfText(name.c_str());
}

void CheckImplClass(const std::string& implClass) {
  if (std::find(kImplClasses.begin(), kImplClasses.end(), implClass) == kImplClasses.end()) {
    throw Instrument::Refused("Unknown implementation class " + implClass,
                              "(" + HostCtl::Text::Join(kImplClasses, ", ", " or ") + ")");
  }
}

}  // namespace TarnCtl::Model
