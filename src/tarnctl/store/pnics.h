// Physical NICs (table pnic) and which switch of a layer holds one (tables
// link, dvs_uplink, opaque).
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "tarnctl/store/layer.h"

namespace TarnCtl::Store {
class Db;
}

namespace TarnCtl::Store::Pnics {

bool Exists(Db& db, const std::string& name);
void Insert(Db& db, const std::string& name, int64_t seq);
void Delete(Db& db, const std::string& name);
// In the order they were added.
std::vector<std::string> Names(Db& db);

// The standard or distributed switch of `layer` that `pnic` is linked to.
std::optional<std::string> LinkedSwitch(Db& db, Layer layer, const std::string& pnic);
// The opaque switch that holds `pnic` among its uplinks.
std::optional<std::string> OpaqueHolder(Db& db, const std::string& pnic);

}  // namespace TarnCtl::Store::Pnics
