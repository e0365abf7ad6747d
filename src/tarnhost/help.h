// tarnhost's usage and help texts, made from the command table.
#pragma once

#include <cstdio>
#include <vector>

#include "tarnhost/table.h"

namespace TarnHost {

// "usage: tarnhost WORDS SYNOPSIS", a line for each command.
void PrintUsageLines(const std::vector<const Command*>& commands, std::FILE* stream);
// The usage lines, then each command's summary, help, options and other spellings.
void PrintHelp(const std::vector<const Command*>& commands, std::FILE* stream);
// Every listed command with its summary, and how to read more.
void PrintTopUsage(std::FILE* stream);

int Help(const Args& args);
int Version(const Args& args);

}  // namespace TarnHost
