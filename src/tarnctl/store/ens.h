// ENS state of portsets (table ens; running state only) and uplink
// reassociations (table ens_event).
#pragma once

#include <cstdint>
#include <string>
#include <vector>

namespace TarnCtl::Store {
class Db;
}

namespace TarnCtl::Store::Ens {

struct Active {
  std::string portset;
  bool intr = false;
  bool fastSwitch = false;
};

bool IsActive(Db& db, const std::string& portset);
void Activate(Db& db, const Active& ens);
void Deactivate(Db& db, const std::string& portset);
// By portset name.
std::vector<Active> List(Db& db);

void AddReassociation(Db& db, const std::string& portset, bool mode, bool force, int64_t seq);

// Test events of DVPorts and ENS reassociations, in the order they happened.
std::vector<std::string> EventTexts(Db& db);

}  // namespace TarnCtl::Store::Ens
