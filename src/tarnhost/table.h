// tarnhost's command table: every command's words, arguments, options,
// summary, help and body. The usage and help texts, the errors of bad
// usage, the completion (`tarnhost __complete`) and the man page's test all
// come from it.
#pragma once

#include <string>
#include <vector>

#include "tarnhost/args.h"

namespace TarnHost {

using Words = std::vector<std::string>;

struct Command {
  Words words;                   // e.g. {"pnic", "add"}
  std::vector<Words> also = {};  // other spellings that run it, not listed (older ones, -h)
  Syntax syntax = {};
  const char* summary;    // one line, for the command lists
  std::string help = {};  // a paragraph; "\n" starts another
  int (*run)(const Args& args) = nullptr;
  bool hidden = false;  // not listed, not completed

  std::string Name() const;  // the words with spaces between
};

const std::vector<Command>& Commands();

// The command whose words (or another spelling of them) begin `words`,
// the longest; sets `used` to the number of words it took. Null when none.
const Command* Find(const Words& words, size_t* used);

// The commands that begin with `prefix` (by their words or another
// spelling): the listed ones, or when there are none, the hidden ones.
std::vector<const Command*> Select(const Words& prefix);

// The words that can follow `prefix` in the listed commands, in table order.
Words NextWords(const Words& prefix);

// How many of the first words of `words` begin a listed command's words.
size_t KnownPrefix(const Words& words);

// Bad usage that the usage lines of `commands` answer (none: a hint to
// 'tarnhost help').
struct CommandError : UsageError {
  CommandError(const std::string& why, std::vector<const Command*> commands)
      : UsageError(why), commands(std::move(commands)) {}
  std::vector<const Command*> commands;
};

// Names the word that is missing after `words` or unknown among them.
[[noreturn]] void Explain(const Words& words);
// Select(), or Explain() when no command matches.
std::vector<const Command*> SelectOrExplain(const Words& prefix);

}  // namespace TarnHost
