// The words and text forms the host reads and writes: CDP statuses and
// distributed switch UUIDs.
#pragma once

#include <array>
#include <cstdint>
#include <string>

#include "hostctl/cdp_words.h"

namespace TarnCtl::Model {

// CDP statuses 0 to 3 by their words.
using HostCtl::Text::kCdpWords;

// The status a word names; refuses other words.
int32_t CdpStatusOfWord(const std::string& word);
// The word of a status; a status outside 0..3 as its number.
using HostCtl::Text::CdpWord;

// Refuses text that is not exactly a UUID text (hostctl/uuid_text.h).
void CheckUuid(const std::string& text);
bool IsUuidText(const std::string& text);
// The UUID text a switch name gives: its first 15 bytes, zero-padded.
std::string UuidOfName(const std::string& name);

// Implementation classes of distributed switches.
inline constexpr std::array<const char*, 2> kImplClasses = {"cswitch", "etherswitch"};
void CheckImplClass(const std::string& implClass);

}  // namespace TarnCtl::Model
