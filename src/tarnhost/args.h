// Command-line words of tarnhost after the command's own words: positional
// arguments and --options (as "--name VALUE" or "--name=VALUE"; "--" ends
// the options). Every mistake throws UsageError, which the caller answers
// with the usage text and exit status 2.
#pragma once

#include <cstdint>
#include <map>
#include <optional>
#include <stdexcept>
#include <string>
#include <vector>

namespace TarnHost {

struct UsageError : std::runtime_error {
  using std::runtime_error::runtime_error;
};

struct OptionSpec {
  const char* name;  // without the leading "--"
  bool takesValue;
  bool repeatable = false;
};

class Args {
 public:
  // Splits `words` by `options`; refuses unknown or repeated options and a
  // positional count outside [minPositional, maxPositional].
  Args(const std::vector<std::string>& words, const std::vector<OptionSpec>& options,
       size_t minPositional, size_t maxPositional);

  const std::string& Positional(size_t index) const { return positional_.at(index); }
  bool Has(const std::string& option) const { return values_.count(option) > 0; }
  std::optional<std::string> Value(const std::string& option) const;
  // Every value of a repeatable option, in order.
  std::vector<std::string> Values(const std::string& option) const;

 private:
  std::vector<std::string> positional_;
  std::map<std::string, std::vector<std::string>> values_;
};

// Decimal digits only, no sign or blanks, within the type's range.
int32_t ParseInt32(const std::string& text, const std::string& what);
uint32_t ParseUint32(const std::string& text, const std::string& what);
int64_t ParseInt64(const std::string& text, const std::string& what);

// "A,B,C" to its names; an empty name is refused.
std::vector<std::string> SplitNames(const std::string& text, const std::string& what);

}  // namespace TarnHost
