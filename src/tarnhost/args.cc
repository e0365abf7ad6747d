#include "tarnhost/args.h"

#include <charconv>

namespace TarnHost {

Args::Args(const std::vector<std::string>& words, const std::vector<OptionSpec>& options,
           size_t minPositional, size_t maxPositional) {
  bool optionsEnded = false;
  for (size_t i = 0; i < words.size(); ++i) {
    const std::string& word = words[i];
    // "-" (standard input) and negative numbers are arguments, not options.
    const bool option = word.size() > 1 && word[0] == '-' && !(word[1] >= '0' && word[1] <= '9');
    if (optionsEnded || !option) {
      positional_.push_back(word);
      continue;
    }
    if (word == "--") {
      optionsEnded = true;
      continue;
    }
    if (word.compare(0, 2, "--") != 0) throw UsageError("unknown option " + word);
    const auto eq = word.find('=');
    const std::string name = word.substr(2, eq == std::string::npos ? std::string::npos : eq - 2);
    const OptionSpec* known = nullptr;
    for (const auto& o : options) {
      if (name == o.name) known = &o;
    }
    if (!known) throw UsageError("unknown option --" + name);
    std::string value;
    if (known->takesValue) {
      if (eq != std::string::npos) {
        value = word.substr(eq + 1);
      } else if (i + 1 < words.size()) {
        value = words[++i];
      } else {
        throw UsageError("option --" + name + " needs a value");
      }
    } else if (eq != std::string::npos) {
      throw UsageError("option --" + name + " takes no value");
    }
    auto& slot = values_[name];
    if (!slot.empty() && !known->repeatable) throw UsageError("option --" + name + " given twice");
    slot.push_back(value);
  }
  if (positional_.size() < minPositional) throw UsageError("missing arguments");
  if (positional_.size() > maxPositional) throw UsageError("too many arguments");
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

}  // namespace TarnHost
