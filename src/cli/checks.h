// The argument checks made between option parsing and the dispatch chain:
// the usage errors of the mask, the positional switch argument and the
// arguments that the chosen command cannot do without.
#pragma once

#include "cli/chain.h"
#include "cli/options.h"

namespace Cli {

// The commands whose steps need the positional switch argument (of any
// length for the exempt ones), a port group name (-p) or a DVPort id (-V).
inline constexpr CommandMask kSwitchNameCommands =
    CommandsNeeding(Need::kSwitchName | Need::kAnySwitchName);
inline constexpr CommandMask kLengthExemptCommands = CommandsNeeding(Need::kAnySwitchName);
inline constexpr CommandMask kPortGroupCommands = CommandsNeeding(Need::kPortGroup);
inline constexpr CommandMask kDVPortCommands = CommandsNeeding(Need::kDVPort);

// Fills options.switchName (and, with --add and a ":ports" suffix,
// options.numPorts) from the first operand argv[firstOperand], when the
// chosen command needs a switch. Returns only when every check passed;
// otherwise the process has ended with status 1 (usage text or one error
// line on standard error).
void CheckArguments(CommandOptions& options, int argc, char** argv, int firstOperand);

}  // namespace Cli
