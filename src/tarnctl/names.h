// Lookups of names across the host's object kinds (running state), and the
// checks of names that every kind shares.
#pragma once

#include <optional>
#include <string>

namespace TarnCtl::Detail {

class Session;

enum class PortsetKind { kStandard, kDistributed, kOpaque };

// A portset of the running state: its kind and the name its object is
// found by (standard: the switch name; distributed and opaque: the switch
// name, while `portset` is the portset name).
struct PortsetName {
  PortsetKind kind;
  std::string name;
  std::string portset;
};

// The portset that `portset` names: a standard switch, or the portset name
// of a distributed or opaque switch.
std::optional<PortsetName> FindPortset(Session& session, const std::string& portset);
// True when a switch or portset of the running state is called `name`.
bool PortsetNameTaken(Session& session, const std::string& name);
// Refuses a switch or portset name that is empty, too long or taken.
void CheckNewSwitchName(Session& session, const std::string& name);

bool PnicExists(Session& session, const std::string& pnic);
// The switch that `pnic` is linked to in the running state (standard,
// distributed or opaque), or "" when it is free.
std::string PnicOwner(Session& session, const std::string& pnic);
// Refuses an unknown pnic and one that is linked to any switch.
void CheckFreePnic(Session& session, const std::string& pnic);

}  // namespace TarnCtl::Detail
