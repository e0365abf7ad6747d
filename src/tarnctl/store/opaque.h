// Opaque switches (table opaque): switches of another control plane that
// this host only shows. Not layered.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

namespace TarnCtl::Store {
class Db;
}

namespace TarnCtl::Store::Opaque {

struct Row {
  std::string portset;
  uint32_t numPorts = 0;
  uint32_t usedPorts = 0;
  std::vector<std::string> uplinks;

  bool operator==(const Row&) const = default;
};

struct Named {
  std::string name;
  Row row;
};

std::optional<Row> Find(Db& db, const std::string& name);
std::optional<std::string> NameOfPortset(Db& db, const std::string& portset);
void Insert(Db& db, const std::string& name, int64_t seq, const Row& row);
void Delete(Db& db, const std::string& name);
// In the order they were added.
std::vector<Named> List(Db& db);

}  // namespace TarnCtl::Store::Opaque
