// orvocfg-vswitch: configures the virtual switches of this host.
#include "cli/dispatch.h"
#include "cli/options.h"
#include "cli/output.h"

int main(int argc, char** argv) {
  // First, so that its check runs last.
  Cli::CheckOutputAtExit();
  int firstOperand = 0;
  Cli::CommandOptions options = Cli::ParseCommandLine(argc, argv, firstOperand);
  return Cli::RunCommands(options, argc, argv, firstOperand);
}
