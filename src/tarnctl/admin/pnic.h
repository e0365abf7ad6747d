// Pnics: the host's physical NICs, and which switch holds each.
#pragma once

#include <string>
#include <vector>

#include "tarnctl/admin/view.h"

namespace TarnCtl::Store {
class Db;
}

namespace TarnCtl::Admin {

struct Pnic {
  std::string name;
  std::string user;    // the running switch that uses it (model's rule); empty: none
  std::string linked;  // the stored switch that links it; empty: none
};

// Every pnic, in the order they were made; their names alone.
std::vector<Pnic> Pnics(Store::Db& db);
std::vector<std::string> PnicNames(Store::Db& db);

void AddPnic(Store::Db& db, const std::string& name);
// Refuses a pnic that a switch, a link or a client still needs.
void RemovePnic(Store::Db& db, const std::string& name);

// The uplinks of a new distributed or opaque switch: existing, free, each
// once.
void CheckFreeUplinks(Store::Db& db, const std::vector<std::string>& uplinks);

// A row each: name, running switch that uses it, stored switch that links it.
std::vector<ListRow> ListPnics(Store::Db& db);

}  // namespace TarnCtl::Admin
