// Placeholder until the dispatch chain lands: an empty mask is a usage error.
#include "cli/dispatch.h"

#include "cli/usage.h"

namespace Cli {

int RunCommands(CommandOptions& options, int, char**, int) {
  if (options.mask == 0) PrintUsage(1);
  return 0;
}

}  // namespace Cli
