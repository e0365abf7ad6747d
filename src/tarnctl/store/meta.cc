#include "tarnctl/store/meta.h"

#include <cassert>
#include <string>

#include "tarnctl/store/db.h"

namespace TarnCtl::Store::Meta {

int64_t NextSeq(Db& db) {
  assert(db.depth() > 0 && "the ordering counter moves inside a transaction");
  auto next = db.Prepare(
      "UPDATE meta SET value = CAST(CAST(value AS INTEGER) + 1 AS TEXT) WHERE key = 'next_seq' "
      "RETURNING CAST(value AS INTEGER) - 1");
  if (!next.Step()) throw db.Error("the ordering counter is missing");
  const int64_t value = next.Int(0);
  next.Run();
  return value;
}

bool EnsNodeSet(Db& db) {
  auto node = db.Prepare("SELECT value FROM meta WHERE key = 'ens_node'");
  return node.Step() && node.Text(0) == "1";
}

void SetEnsNode(Db& db, uint32_t value) {
  db.Prepare("INSERT OR REPLACE INTO meta(key, value) VALUES ('ens_node', ?)")
      .Bind(1, std::to_string(value))
      .Run();
}

}  // namespace TarnCtl::Store::Meta
