#include "tarnctl/model/invariants.h"

#include <vector>

#include "tarnctl/store/checks.h"

namespace TarnCtl::Model {

namespace {

namespace Checks = Store::Checks;

struct Invariant {
  Checks::Offender (*find)(Store::Db&);
  // "{0}", "{1}", ... stand for the offender's values; "{layer N}" for a
  // value that is a layer, shown by its name.
  const char* text;
};

const Invariant kInvariants[] = {
    {Checks::PortGroupWithoutSwitch,
     "port group {0} belongs to switch {1}, which does not exist in the {layer 2}"},
    {Checks::LinkWithoutSwitch,
     "pnic {0} is linked to switch {1}, which does not exist in the {layer 2}"},
    {Checks::LinkOfUnknownPnic, "pnic {0}, linked to {1}, does not exist"},
    {Checks::UplinkWithoutSwitch,
     "uplink {0} belongs to distributed switch {1}, which does not exist in the {layer 2}"},
    {Checks::UplinkOfUnknownPnic, "uplink {0} of {1} is not a pnic"},
    {Checks::UplinkOnUnknownPort, "uplink {0} is on DVPort {1}, which does not exist"},
    {Checks::ClientOnUnknownPort, "client {0} is on DVPort {1}, which does not exist"},
    {Checks::OpaqueUplinkUnknown, "uplink {0} of opaque switch {1} is not a pnic"},
    {Checks::PnicUsedTwice, "pnic {0} is used by two switches of the running state"},
    {Checks::SwitchNameUsedTwice, "switch or portset name {0} is used twice in the running state"},
    {Checks::OverfullStandardSwitch, "switch {0} has {1} ports in use but only {2} ports"},
    {Checks::OverfullDistributedSwitch,
     "distributed switch {0} has {1} DVPorts but only {2} ports"},
    {Checks::EnsOnUnknownPortset, "ENS is active on {0}, which is no running portset"},
};

std::string LayerWord(const std::string& value) {
  return value == "0" ? "stored configuration" : "running state";
}

}  // namespace

std::optional<std::string> FirstViolation(Store::Db& db) {
  for (const Invariant& invariant : kInvariants) {
    const auto offender = invariant.find(db);
    if (!offender) continue;
    std::string text = invariant.text;
    for (size_t i = 0; i < offender->size(); ++i) {
      const std::string& value = (*offender)[i];
      for (const bool layer : {false, true}) {
        const std::string mark = std::string(layer ? "{layer " : "{") + std::to_string(i) + "}";
        if (const auto at = text.find(mark); at != std::string::npos) {
          text.replace(at, mark.size(), layer ? LayerWord(value) : value);
        }
      }
    }
    return text;
  }
  return std::nullopt;
}

}  // namespace TarnCtl::Model
