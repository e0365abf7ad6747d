#include "tarnctl/instrument/operations.h"

#include <algorithm>
#include <vector>

#include "hostctl/edit_distance.h"
#include "hostctl/join.h"

namespace TarnCtl::Instrument {

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
    const size_t distance = HostCtl::Text::EditDistance(name, operation.name);
    if (best == nullptr || distance < bestDistance) {
      best = &operation;
      bestDistance = distance;
    }
  }
  // Up to about a third of the name may be wrong (the distance counts halves).
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
  return HostCtl::Text::Join(words, ", ", " or ");
}

}  // namespace TarnCtl::Instrument
