// tarnhost's usage text.
#pragma once

#include <cstdio>

namespace TarnHost {

void PrintUsage(std::FILE* stream);

}  // namespace TarnHost
