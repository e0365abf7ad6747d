// The argument checks made between option parsing and the dispatch chain:
// the usage errors of the mask, the positional switch argument and the
// arguments that the chosen command cannot do without.
#pragma once

#include "cli/options.h"

namespace Cli {

// Commands that act on the switch named by the positional argument.
inline constexpr CommandMask kSwitchNameCommands =
    Bit::kAdd | Bit::kDelete | Bit::kLink | Bit::kUnlink | Bit::kAddPg | Bit::kDelPg | Bit::kCheck |
    Bit::kVlan | Bit::kCdp | Bit::kMtu | Bit::kTestSyncNota | Bit::kAddPgUplink |
    Bit::kDelPgUplink | Bit::kAddDvpUplink | Bit::kDelDvpUplink | Bit::kGetMaxActive |
    Bit::kSetMaxActive | Bit::kActivateEns | Bit::kDeactivateEns | Bit::kReassociateEns |
    Bit::kForceReassociateEns;
// Commands whose switch name is handed on without a length test.
inline constexpr CommandMask kLengthExemptCommands = Bit::kAddDvpUplink | Bit::kDelDvpUplink;
// Commands that need a port group name (-p).
inline constexpr CommandMask kPortGroupCommands =
    Bit::kVlan | Bit::kAddPgUplink | Bit::kDelPgUplink;
// Commands that need a DVPort id (-V).
inline constexpr CommandMask kDVPortCommands =
    Bit::kTestSyncNota | Bit::kAddDvpUplink | Bit::kDelDvpUplink;

static_assert(kSwitchNameCommands == 0x2e0ffddb);
static_assert(kLengthExemptCommands == 0x30000);
static_assert(kPortGroupCommands == 0xc400);
static_assert(kDVPortCommands == 0x32000);

// Fills options.switchName (and, with --add and a ":ports" suffix,
// options.numPorts) from the first operand argv[firstOperand], when the
// chosen command needs a switch. Returns only when every check passed;
// otherwise the process has ended with status 1 (usage text or one error
// line on standard error).
void CheckArguments(CommandOptions& options, int argc, char** argv, int firstOperand);

}  // namespace Cli
