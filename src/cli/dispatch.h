// Everything after option parsing: the argument checks, the dispatch chain
// and the run-wide handler.
#pragma once

#include "cli/options.h"

namespace Cli {

// Checks the positional argument and the companions of the chosen command,
// then runs the dispatch chain. Returns the run status (the exit status);
// only a failed argument check ends the process itself.
int RunCommands(CommandOptions& options, int argc, char** argv, int firstOperand);

}  // namespace Cli
