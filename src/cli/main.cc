// orvocfg-vswitch: configures the virtual switches of this host.
#include "cli/dispatch.h"
#include "cli/options.h"

int main(int argc, char** argv) {
  int firstOperand = 0;
  Cli::CommandOptions options = Cli::ParseCommandLine(argc, argv, firstOperand);
  return Cli::RunCommands(options, argc, argv, firstOperand);
}
