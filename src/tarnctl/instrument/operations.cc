#include "tarnctl/instrument/operations.h"

#include <algorithm>
#include <cctype>
#include <vector>

namespace TarnCtl::Instrument {

namespace {

// Edits (insertions, deletions, substitutions, case changes counted as
// half) that turn `a` into `b`, times two.
size_t Distance(std::string_view a, std::string_view b) {
  std::vector<size_t> row(b.size() + 1);
  for (size_t j = 0; j <= b.size(); ++j) row[j] = 2 * j;
  for (size_t i = 1; i <= a.size(); ++i) {
    size_t diagonal = row[0];
    row[0] = 2 * i;
    for (size_t j = 1; j <= b.size(); ++j) {
      const size_t above = row[j];
      size_t substitution = 0;
      if (a[i - 1] != b[j - 1]) {
        substitution = std::tolower(static_cast<unsigned char>(a[i - 1])) ==
                               std::tolower(static_cast<unsigned char>(b[j - 1]))
                           ? 1
                           : 2;
      }
      row[j] = std::min({row[j] + 2, row[j - 1] + 2, diagonal + substitution});
      diagonal = above;
    }
  }
  return row[b.size()];
}

}  // namespace

const Operation& Describe(Op op) {
  return kOperations[static_cast<size_t>(op)];
}

const Operation* FindOperation(std::string_view name) {
  const auto operations = Operations();
  const auto found = std::lower_bound(operations.begin(), operations.end(), name,
                                      [](const Operation& operation, std::string_view key) {
                                        return std::string_view(operation.name) < key;
                                      });
  return found != operations.end() && found->name == name ? &*found : nullptr;
}

std::optional<std::string> NearestOperation(std::string_view name) {
  const Operation* best = nullptr;
  size_t bestDistance = 0;
  for (const Operation& operation : Operations()) {
    const size_t distance = Distance(name, operation.name);
    if (best == nullptr || distance < bestDistance) {
      best = &operation;
      bestDistance = distance;
    }
  }
  // Up to about a third of the name may be wrong.
  if (best == nullptr || bestDistance > 2 * std::max<size_t>(2, name.size() / 3)) {
    return std::nullopt;
  }
  return best->name;
}

std::string TargetText(unsigned targets) {
  static const std::pair<unsigned, const char*> kWords[] = {
      {kNameArgument, "the name it is given"},
      {kStandardSwitch, "a standard switch"},
      {kDistributedSwitch, "a distributed switch (switch or portset name)"},
      {kOpaqueSwitch, "an opaque switch (switch or portset name)"},
      {kPortGroup, "a port group"},
      {kDVPort, "a DVPort (port id)"},
      {kRecord, "a record class"},
  };
  std::vector<const char*> words;
  for (const auto& [bit, word] : kWords) {
    if (targets & bit) words.push_back(word);
  }
  if (words.empty()) return "nothing (any call)";
  std::string text;
  for (size_t i = 0; i < words.size(); ++i) {
    if (i > 0) text += i + 1 == words.size() ? " or " : ", ";
    text += words[i];
  }
  return text;
}

}  // namespace TarnCtl::Instrument
