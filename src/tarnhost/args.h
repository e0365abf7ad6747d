// Command-line words of tarnhost after the command's own words: positional
// arguments and --options (as "--name VALUE" or "--name=VALUE"; "--" ends
// the options; -h or --help asks for the command's help). Every mistake
// throws UsageError, which the caller answers with the command's usage
// lines and exit status 2.
#pragma once

#include <cstdint>
#include <map>
#include <optional>
#include <stdexcept>
#include <string>
#include <vector>

#include "hostctl/join.h"

namespace TarnHost {

using HostCtl::Text::Join;

struct UsageError : std::runtime_error {
  using std::runtime_error::runtime_error;
};

// What a word names, for completion: the words that can stand there come
// from tarnhost itself (command words, operation names), from the shell
// (files), or, for the host's objects, from the host (complete.cc).
enum class Kind {
  Text,       // free text or a new name: nothing to offer
  Number,     // decimal
  File,       // a file, or - for standard input
  Command,    // tarnhost's own command words
  Operation,  // a library operation that a fault can make fail
  Pnic,
  PnicList,  // free pnics separated by commas
  PortGroup,
  Client,  // a client of the port group named before it
  Switch,  // a standard or distributed switch
  SystemSwitch,
  DVSwitch,
  DVPort,  // a DVPort id of the switch named before it
  OpaqueSwitch,
  Portset,
  Object,    // any named object: switch, portset, port group, DVPort id
  Showable,  // what show NAME shows: switch, port group, DVS:PORTID
  Fault,     // the number of an armed fault
  Snapshot,  // the name of a snapshot of the host
  State,     // a snapshot's name or a file (- for standard input)
};

struct OptionDef {
  const char* name;             // without the leading "--"
  const char* value = nullptr;  // placeholder of its value in usage text; none: a flag
  bool repeatable = false;
  std::string help;
  Kind kind = Kind::Text;  // of its value

  bool TakesValue() const { return value != nullptr; }
  std::string Usage() const;  // "--name VALUE"
};

struct ArgumentDef {
  const char* name;  // placeholder in usage text, e.g. PORTGROUP
  Kind kind = Kind::Text;
  bool optional = false;
  bool repeats = false;  // the last argument only: any number of them
};

struct Syntax {
  std::vector<ArgumentDef> arguments = {};
  std::vector<OptionDef> options = {};
  bool raw = false;  // every word is an argument: no options, no --help
  // The arguments are the words after "--", taken as they are (a command
  // line); the options come before it.
  bool rest = false;

  const OptionDef* Option(const std::string& name) const;
  // The arguments and options as usage text shows them.
  std::string Synopsis() const;
};

// The words of a command line as its syntax reads them, without judging
// them: Args refuses what is wrong, completion looks at where the cursor
// stands. Options end at "--" (with `rest`, at the first "--", and every
// word after it is an argument as it is).
struct Tokens {
  struct Option {
    std::string word;                  // as given, up to any "="
    const OptionDef* def;              // null: not an option of the syntax
    std::optional<std::string> value;  // after "=", or the next word for one that takes it
    bool inlineValue = false;          // the value came after "="
  };
  std::vector<std::string> arguments;  // before "--" (all of them, without `rest`)
  std::vector<Option> options;
  bool help = false;                             // -h or --help among the options
  bool ended = false;                            // a "--" was seen: what follows is no option
  std::optional<std::vector<std::string>> rest;  // with `rest`: the words after "--"
};
Tokens Tokenize(const std::vector<std::string>& words, const Syntax& syntax);

class Args {
 public:
  // Splits `words` by `syntax`; refuses unknown or repeated options and
  // missing or extra arguments, naming them and, in messages about
  // options, `command`. When -h or --help is among the options, nothing is
  // refused: the caller shows the help instead.
  Args(const std::vector<std::string>& words, const Syntax& syntax, const std::string& command);

  bool HelpRequested() const { return help_; }
  const std::vector<std::string>& Positionals() const { return positional_; }
  const std::string& Positional(size_t index) const { return positional_.at(index); }
  bool Has(const std::string& option) const { return values_.count(option) > 0; }
  std::optional<std::string> Value(const std::string& option) const;
  // Every value of a repeatable option, in order.
  std::vector<std::string> Values(const std::string& option) const;

 private:
  std::vector<std::string> positional_;
  std::map<std::string, std::vector<std::string>> values_;
  bool help_ = false;
};

// True when `word` is an option word: "-" (standard input) and negative
// numbers are arguments.
bool IsOptionWord(const std::string& word);
// -h or --help.
bool IsHelpWord(const std::string& word);

// Decimal digits only, no sign or blanks, within the type's range.
int32_t ParseInt32(const std::string& text, const std::string& what);
uint32_t ParseUint32(const std::string& text, const std::string& what);
int64_t ParseInt64(const std::string& text, const std::string& what);

// "A,B,C" to its names; an empty name is refused.
std::vector<std::string> SplitNames(const std::string& text, const std::string& what);

// The candidates nearest to a mistyped `word` (by edit distance, or those
// it is a prefix of), for "did you mean ..."; empty when none is close.
std::vector<std::string> Nearest(const std::string& word,
                                 const std::vector<std::string>& candidates);
// "; did you mean A or B?" for the nearest candidates, each after `before`,
// or "".
std::string DidYouMean(const std::string& word, const std::vector<std::string>& candidates,
                       const std::string& before = "");

}  // namespace TarnHost
