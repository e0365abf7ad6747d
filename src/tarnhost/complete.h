// Completion of tarnhost's command lines, for the shell (completions/tarnhost
// calls `tarnhost __complete WORD...`): command words, options and the
// arguments' words, from the command table.
#pragma once

#include <string>
#include <vector>

#include "tarnhost/args.h"

namespace TarnHost {

// The library operations that `fault add` can make fail.
const std::vector<std::string>& FaultOperationNames();

// Prints "files" or "words" for the last of the words (the one being
// completed; the others come before it), then the words that fit there,
// one a line.
int Complete(const Args& args);

// Prints the names of the host's objects of the kind named by the first
// word (of the owner named by the second), one a line, without waiting for
// the host or creating it: for the completion of other programs.
int Names(const Args& args);

}  // namespace TarnHost
