// Armed failures (table fault), in the order they were armed.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

namespace TarnCtl::Store {
class Db;
}

namespace TarnCtl::Store::Faults {

// What a fault armed without a message or detail of its own says.
inline constexpr const char* kDefaultMessage = "injected fault";
inline std::string DefaultDetail(const std::string& operation) {
  return std::string(kDefaultMessage) + " in " + operation;
}

struct Row {
  int64_t id = 0;  // set by Insert
  std::string operation;
  std::optional<std::string> target;  // none: any call
  std::string message;
  std::string detail;
  int64_t skip = 0;
  int64_t times = 1;

  bool operator==(const Row&) const = default;
};

std::vector<Row> List(Db& db);
int64_t Insert(Db& db, const Row& row);
// One call let through: skip goes down by one.
void UseSkip(Db& db, int64_t id);
// One call failed: times goes down by one; the row goes at zero.
void UseTime(Db& db, int64_t id);
// False when no fault has that id.
bool Delete(Db& db, int64_t id);
void Clear(Db& db);

}  // namespace TarnCtl::Store::Faults
