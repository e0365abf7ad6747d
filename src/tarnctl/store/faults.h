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
  int64_t times = 1;    // calls still to fail (or, with pass, to slow down)
  int64_t delayMs = 0;  // how long a matching call waits before it goes on
  bool pass = false;    // after the wait the call goes on normally
  bool always = false;  // every matching call, for as long as it is armed
  int64_t fired = 0;    // calls it failed or slowed down

  bool operator==(const Row&) const = default;
};

// A fault that has done all it was armed for: it stays listed until it is
// removed, and matches no call.
inline bool Spent(const Row& row) {
  return !row.always && row.skip <= 0 && row.times <= 0;
}

// What one field of a fault holds, for the rule its values obey.
enum class Value { kId, kOperation, kTarget, kText, kSkip, kTimes, kDelay, kFlag, kCount };

struct Field {
  const char* column;  // in the table and the dump
  const char* key;     // in the host's JSON
  Value value;
  int listed;  // its place in a row of the fault list
};

// Every field of a fault, described once: the table, the dump, the list and
// the JSON visit them in column order. `visit(field, member)` is called
// with const or non-const rows alike.
template <typename R, typename Visit>
void VisitFields(R& row, Visit&& visit) {
  visit(Field{"id", "number", Value::kId, 0}, row.id);
  visit(Field{"operation", "operation", Value::kOperation, 1}, row.operation);
  visit(Field{"target", "on", Value::kTarget, 2}, row.target);
  visit(Field{"message", "message", Value::kText, 5}, row.message);
  visit(Field{"detail", "detail", Value::kText, 6}, row.detail);
  visit(Field{"skip", "skip", Value::kSkip, 3}, row.skip);
  visit(Field{"times", "times", Value::kTimes, 4}, row.times);
  visit(Field{"delay_ms", "delayMs", Value::kDelay, 7}, row.delayMs);
  visit(Field{"pass", "pass", Value::kFlag, 8}, row.pass);
  visit(Field{"always", "always", Value::kFlag, 9}, row.always);
  visit(Field{"fired", "fired", Value::kCount, 10}, row.fired);
}
inline constexpr int kFieldCount = 11;

std::vector<Row> List(Db& db);
int64_t Insert(Db& db, const Row& row);
// One call let through: skip goes down by one.
void UseSkip(Db& db, int64_t id);
// One call failed or slowed down: fired goes up by one, and times down by
// one unless the fault is armed for every call. A fault at zero stays,
// spent.
void Fire(Db& db, int64_t id);
// False when no fault has that id.
bool Delete(Db& db, int64_t id);
void Clear(Db& db);

}  // namespace TarnCtl::Store::Faults
