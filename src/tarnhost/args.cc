#include "tarnhost/args.h"

#include <algorithm>
#include <charconv>

#include "hostctl/edit_distance.h"

namespace TarnHost {

const OptionDef* Syntax::Option(const std::string& name) const {
  for (const auto& o : options) {
    if (name == o.name) return &o;
  }
  return nullptr;
}

std::string OptionDef::Usage() const {
  return "--" + std::string(name) + (TakesValue() ? " " + std::string(value) : "");
}

std::string Syntax::Synopsis() const {
  std::vector<std::string> parts;
  auto addArguments = [&] {
    for (const auto& a : arguments) {
      const std::string name = std::string(a.name) + (a.repeats ? "..." : "");
      parts.push_back(a.optional ? "[" + name + "]" : name);
    }
  };
  if (!rest) addArguments();
  for (const auto& o : options) {
    parts.push_back("[" + o.Usage() + "]" + (o.repeatable ? "..." : ""));
  }
  if (rest) {
    parts.push_back("--");
    addArguments();
  }
  return Join(parts, " ");
}

bool IsOptionWord(const std::string& word) {
  return word.size() > 1 && word[0] == '-' && !(word[1] >= '0' && word[1] <= '9');
}

bool IsHelpWord(const std::string& word) {
  return word == "-h" || word == "--help";
}

Tokens Tokenize(const std::vector<std::string>& words, const Syntax& syntax) {
  Tokens tokens;
  if (syntax.raw) {
    tokens.arguments = words;
    return tokens;
  }
  const auto end = syntax.rest ? std::find(words.begin(), words.end(), "--") : words.end();
  if (syntax.rest && end != words.end()) tokens.rest.emplace(end + 1, words.end());
  const size_t own = end - words.begin();
  for (size_t i = 0; i < own; ++i) {
    const std::string& word = words[i];
    if (tokens.ended || !IsOptionWord(word)) {
      tokens.arguments.push_back(word);
    } else if (word == "--") {
      tokens.ended = true;
    } else if (IsHelpWord(word)) {
      tokens.help = true;
    } else {
      const auto eq = word.find('=');
      Tokens::Option option{word.substr(0, eq), nullptr, std::nullopt};
      if (word.compare(0, 2, "--") == 0) option.def = syntax.Option(option.word.substr(2));
      if (eq != std::string::npos) {
        option.value = word.substr(eq + 1);
        option.inlineValue = true;
      } else if (option.def && option.def->TakesValue() && i + 1 < own) {
        option.value = words[++i];
      }
      tokens.options.push_back(std::move(option));
    }
  }
  if (syntax.rest && end != words.end()) tokens.ended = true;
  return tokens;
}

Args::Args(const std::vector<std::string>& words, const Syntax& syntax,
           const std::string& command) {
  // The first mistake is reported, but only once every word was seen: a
  // --help further on wins.
  std::optional<std::string> mistake;
  auto refuse = [&](const std::string& why) {
    if (!mistake) mistake = why;
  };
  const Tokens tokens = Tokenize(words, syntax);
  positional_ = tokens.arguments;
  if (syntax.raw) return;
  help_ = tokens.help;
  for (const auto& option : tokens.options) {
    if (!option.def) {
      std::vector<std::string> names;
      for (const auto& o : syntax.options) names.push_back("--" + std::string(o.name));
      refuse("unknown option " + option.word + " for " + command + DidYouMean(option.word, names));
      continue;
    }
    const std::string name = option.def->name;
    if (option.def->TakesValue() && !option.value) {
      refuse("option --" + name + " needs a value");
    } else if (!option.def->TakesValue() && option.inlineValue) {
      refuse("option --" + name + " takes no value");
    }
    auto& slot = values_[name];
    if (!slot.empty() && !option.def->repeatable) refuse("option --" + name + " given twice");
    slot.push_back(option.def->TakesValue() ? option.value.value_or("") : "");
  }
  if (syntax.rest) {
    if (!positional_.empty()) refuse("unexpected argument " + positional_[0] + " before --");
    if (!tokens.rest) refuse("missing -- before " + std::string(syntax.arguments[0].name));
    positional_ = tokens.rest.value_or(std::vector<std::string>{});
  }
  if (help_) return;
  if (mistake) throw UsageError(*mistake);
  const auto& defs = syntax.arguments;
  const size_t required =
      std::count_if(defs.begin(), defs.end(), [](const ArgumentDef& a) { return !a.optional; });
  if (positional_.size() < required) {
    std::vector<const char*> missing;
    for (size_t k = positional_.size(); k < required; ++k) missing.push_back(defs[k].name);
    throw UsageError("missing " + Join(missing, " "));
  }
  if (positional_.size() > defs.size() && (defs.empty() || !defs.back().repeats)) {
    throw UsageError("unexpected argument " + positional_[defs.size()]);
  }
}

std::optional<std::string> Args::Value(const std::string& option) const {
  auto it = values_.find(option);
  if (it == values_.end()) return std::nullopt;
  return it->second.back();
}

std::vector<std::string> Args::Values(const std::string& option) const {
  auto it = values_.find(option);
  return it == values_.end() ? std::vector<std::string>{} : it->second;
}

namespace {

template <typename T>
T ParseDecimal(const std::string& text, const std::string& what) {
  T value{};
  const char* begin = text.data();
  const char* end = begin + text.size();
  if (text.empty() || text[0] < '0' || text[0] > '9') {
    throw UsageError("bad number for " + what + ": \"" + text + "\"");
  }
  auto [ptr, ec] = std::from_chars(begin, end, value, 10);
  if (ec == std::errc::result_out_of_range) {
    throw UsageError("number for " + what + " out of range: " + text);
  }
  if (ec != std::errc() || ptr != end) {
    throw UsageError("bad number for " + what + ": \"" + text + "\"");
  }
  return value;
}

}  // namespace

int32_t ParseInt32(const std::string& text, const std::string& what) {
  return ParseDecimal<int32_t>(text, what);
}
uint32_t ParseUint32(const std::string& text, const std::string& what) {
  return ParseDecimal<uint32_t>(text, what);
}
int64_t ParseInt64(const std::string& text, const std::string& what) {
  return ParseDecimal<int64_t>(text, what);
}

std::vector<std::string> SplitNames(const std::string& text, const std::string& what) {
  std::vector<std::string> names;
  size_t start = 0;
  while (true) {
    const auto comma = text.find(',', start);
    std::string name = text.substr(start, comma == std::string::npos ? comma : comma - start);
    if (name.empty()) throw UsageError("empty name in " + what);
    names.push_back(std::move(name));
    if (comma == std::string::npos) return names;
    start = comma + 1;
  }
}

std::vector<std::string> Nearest(const std::string& word,
                                 const std::vector<std::string>& candidates) {
  std::vector<std::string> nearest;
  if (word.size() >= 2) {  // a beginning names what it begins
    for (const auto& c : candidates) {
      if (c.size() > word.size() && c.compare(0, word.size(), word) == 0) nearest.push_back(c);
    }
    if (!nearest.empty()) return nearest;
  }
  // More edits than one (two in a longer word) is another word; the
  // distance counts halves.
  size_t best = word.size() <= 4 ? 2 : 4;
  for (const auto& c : candidates) {
    const size_t d = HostCtl::Text::EditDistance(word, c);
    if (d < best) nearest.clear();
    if (d <= best) {
      best = d;
      nearest.push_back(c);
    }
  }
  return nearest;
}

std::string DidYouMean(const std::string& word, const std::vector<std::string>& candidates,
                       const std::string& before) {
  std::vector<std::string> named;
  for (const auto& n : Nearest(word, candidates)) named.push_back(before + n);
  return named.empty() ? "" : "; did you mean " + Join(named, ", ", " or ") + "?";
}

}  // namespace TarnHost
