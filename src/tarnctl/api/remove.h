// Removal of switches, shared by the library's RemoveVirtualSwitch and by
// the host's administration (which removes system and distributed
// switches): one set of rules for both.
#pragma once

#include <string>

namespace TarnCtl::Store {
class Db;
}

namespace TarnCtl::Api {

// Refuses a standard switch whose port groups have clients ("Virtual
// switch X has N ports in use"); else drops it from both layers with its
// port groups, links and ENS. REQUIRES: the switch runs; a Call or Scope
// names the operation.
void RemoveStandardSwitch(Store::Db& db, const std::string& name);

// Refuses a distributed switch with a DVPort in use ("DVS X has N ports in
// use"); else drops it from the running state and the cache with its
// uplinks, DVPorts and ENS. REQUIRES: the switch runs with that portset; a
// Call or Scope names the operation.
void RemoveDVSwitch(Store::Db& db, const std::string& name, const std::string& portset);

}  // namespace TarnCtl::Api
