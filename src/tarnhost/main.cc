// tarnhost: administration of the simulated host (see docs/host.md).
//
// Exit status: 0 success; 1 when the host refused (its message follows
// "tarnhost: " on standard error); 2 for bad usage (the reason and the
// usage text on standard error).
#include <cstdio>
#include <exception>
#include <string>
#include <vector>

#include "hostctl/exception.h"
#include "tarnhost/args.h"
#include "tarnhost/commands.h"
#include "tarnhost/usage.h"

namespace {

using namespace TarnHost;

struct Command {
  std::vector<std::string> words;
  int (*run)(const Words& args);
};

const std::vector<Command>& Commands() {
  static const std::vector<Command> commands = {
      {{"init"}, Init},
      {{"show"}, Show},
      {{"dump"}, Dump},
      {{"load"}, Load},
      {{"reboot"}, Reboot},
      {{"pnic", "add"}, AddPnic},
      {{"client", "add"}, AddClient},
      {{"system-switch", "add"}, AddSystemSwitch},
      {{"dvs", "add"}, AddDVSwitch},
      {{"dvport", "add"}, AddDVPort},
      {{"opaque", "add"}, AddOpaque},
      {{"timeout", "uplink"}, AddUplinkTimeout},
      {{"timeout", "lag"}, AddLagTimeout},
      {{"fault", "add"}, AddFault},
      {{"fault", "clear"}, ClearFaults},
  };
  return commands;
}

const Command* Find(const std::vector<std::string>& argv) {
  for (const auto& c : Commands()) {
    if (argv.size() < c.words.size()) continue;
    bool match = true;
    for (size_t i = 0; i < c.words.size(); ++i) match = match && argv[i] == c.words[i];
    if (match) return &c;
  }
  return nullptr;
}

int UsageFailure(const std::string& why) {
  std::fprintf(stderr, "tarnhost: %s\n", why.c_str());
  PrintUsage(stderr);
  return 2;
}

}  // namespace

int main(int argc, char** argv) {
  const std::vector<std::string> words(argv + 1, argv + argc);
  if (words.size() == 1 && (words[0] == "-h" || words[0] == "--help")) {
    PrintUsage(stdout);
    return std::fflush(stdout) == 0 ? 0 : 1;
  }
  if (words.empty()) return UsageFailure("no command given");
  const Command* command = Find(words);
  if (!command) {
    // Name the second word too when the first one starts a command.
    std::string given = words[0];
    for (const auto& c : Commands()) {
      if (c.words.size() > 1 && c.words[0] == words[0]) {
        if (words.size() == 1) return UsageFailure("missing subcommand after " + given);
        given += " " + words[1];
        break;
      }
    }
    return UsageFailure("unknown command: " + given);
  }
  try {
    return command->run(Words(words.begin() + command->words.size(), words.end()));
  } catch (const UsageError& e) {
    return UsageFailure(e.what());
  } catch (const HostCtl::Lib::HostCtlException& e) {
    std::fprintf(stderr, "tarnhost: %s\n", e.GetMessage().c_str());
    return 1;
  } catch (const std::exception& e) {
    std::fprintf(stderr, "tarnhost: %s\n", e.what());
    return 1;
  }
}
