#include "tarnctl/store/meta.h"

#include <cassert>
#include <string>

#include "tarnctl/store/db.h"

namespace TarnCtl::Store::Meta {

int64_t NextSeq(Db& db) {
  assert(db.depth() > 0 && "the ordering counter moves inside a transaction");
  int64_t value = 0;
  {
    auto next = db.Prepare("SELECT CAST(value AS INTEGER) FROM meta WHERE key = 'next_seq'");
    if (!next.Step()) throw db.Error("the ordering counter is missing");
    value = next.Int(0);
  }
  db.Prepare("UPDATE meta SET value = ? WHERE key = 'next_seq'")
      .Bind(1, std::to_string(value + 1))
      .Run();
  return value;
}

bool EnsNodeSet(Db& db) {
  auto node = db.Prepare("SELECT value FROM meta WHERE key = 'ens_node'");
  return node.Step() && node.Text(0) == "1";
}

void SetEnsNode(Db& db, uint32_t value) {
  SetValue(db, "ens_node", std::to_string(value));
}

std::optional<std::string> Value(Db& db, const std::string& key) {
  auto select = db.Prepare("SELECT value FROM meta WHERE key = ?");
  if (!select.Bind(1, key).Step()) return std::nullopt;
  return select.Text(0);
}

void SetValue(Db& db, const std::string& key, const std::string& value) {
  db.Prepare("INSERT OR REPLACE INTO meta(key, value) VALUES (?, ?)")
      .Bind(1, key)
      .Bind(2, value)
      .Run();
}

}  // namespace TarnCtl::Store::Meta
