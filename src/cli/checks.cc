#include "cli/checks.h"

#include <cstdint>
#include <cstdlib>
#include <iostream>
#include <string>

#include "cli/usage.h"
#include "hostctl/network.h"

namespace Cli {
namespace {

[[noreturn]] void Fail(const std::string& line) {
  std::cerr << line << std::endl;
  std::exit(1);
}

// "name" or, with --add, "name:ports". The port count is read like strtol
// with base 0 reads it and cut to 32 bits; no range is checked.
void TakeSwitchOperand(CommandOptions& options, const std::string& operand) {
  const auto colon = operand.find(':');
  if ((options.mask & Bit::kAdd) != 0 && colon != std::string::npos) {
    options.switchName = operand.substr(0, colon);
    const std::string ports = operand.substr(colon + 1);
    options.numPorts = static_cast<int32_t>(std::strtol(ports.c_str(), nullptr, 0));
  } else {
    options.switchName = operand;
  }
}

}  // namespace

void CheckArguments(CommandOptions& options, int argc, char** argv, int firstOperand) {
  const CommandMask mask = options.mask;
  if (mask == 0) PrintUsage(1);
  if ((mask & Bit::kActivateEns) != 0 && (mask & Bit::kDeactivateEns) != 0) PrintUsage(1);

  if ((mask & kSwitchNameCommands) != 0) {
    if (firstOperand >= argc) Fail("No virtual switch name specified");
    TakeSwitchOperand(options, argv[firstOperand]);
    const uint32_t limit = HostCtl::Network::Portset::MAX_VSNAME_SZ;
    if ((mask & kLengthExemptCommands) == 0 && options.switchName.size() >= limit) {
      Fail("Virtual switch name too long (should be < " + std::to_string(limit) + ")");
    }
  }
  if ((mask & kPortGroupCommands) != 0 && options.portGroupName.empty()) {
    Fail("No portgroup name specified. Specify with -p option");
  }
  if ((mask & kDVPortCommands) != 0 && options.dvPortId.empty()) {
    Fail("No DVPort ID specified. Specify with -V option");
  }
}

}  // namespace Cli
