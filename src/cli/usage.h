// The usage text: the tool's only help output and the reply to usage errors.
#pragma once

namespace Cli {

// The word that stands for every port group of a switch in -v.
inline constexpr const char kAllPortGroups[] = "ALL";

// Writes the usage text to standard output and ends the process with `status`.
[[noreturn]] void PrintUsage(int status);

}  // namespace Cli
