// tarnhost: administration of the simulated host (see docs/host.md). Its
// commands are the rows of the command table (table.cc).
//
// Exit status: 0 success; 1 when the host refused (the reason with its
// explanation follows "tarnhost: " on standard error); 2 for bad usage (the reason and the
// command's usage lines on standard error; nothing is opened).
#include <cstdio>
#include <exception>
#include <string>
#include <vector>

#include "hostctl/exception.h"
#include "tarnctl/admin/host.h"
#include "tarnhost/args.h"
#include "tarnhost/commands.h"
#include "tarnhost/help.h"
#include "tarnhost/table.h"

namespace {

using namespace TarnHost;

int UsageFailure(const std::string& why, const std::vector<const Command*>& commands) {
  std::fprintf(stderr, "tarnhost: %s\n", why.c_str());
  if (commands.empty()) std::fputs("see 'tarnhost help'\n", stderr);
  PrintUsageLines(commands, stderr);
  return 2;
}

}  // namespace

int main(int argc, char** argv) {
  const Words words(argv + 1, argv + argc);
  if (words.empty()) {
    std::fputs("tarnhost: no command given\n", stderr);
    PrintTopUsage(stderr);
    return 2;
  }
  const Command* command = nullptr;
  try {
    size_t used = 0;
    command = Find(words, &used);
    if (!command) {
      // -h or --help right after the first words of some commands: theirs.
      const size_t known = KnownPrefix(words);
      if (known == 0 || known == words.size() || !IsHelpWord(words[known])) Explain(words);
      PrintHelp(Select(Words(words.begin(), words.begin() + known)), stdout);
      return Print("");
    }
    const Args args(Words(words.begin() + used, words.end()), command->syntax, command->Name());
    if (!args.HelpRequested()) return command->run(args);
    PrintHelp({command}, stdout);
    return Print("");  // checks that it was written
  } catch (const CommandError& e) {
    return UsageFailure(e.what(), e.commands);
  } catch (const UsageError& e) {
    return UsageFailure(e.what(), {command});
  } catch (const HostCtl::Lib::HostCtlException& e) {
    std::fprintf(stderr, "tarnhost: %s\n", TarnCtl::Admin::Reason(e).c_str());
    return 1;
  } catch (const std::exception& e) {
    std::fprintf(stderr, "tarnhost: %s\n", e.what());
    return 1;
  }
}
