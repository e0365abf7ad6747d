// A copy of one database row held by a library object. It is read again
// once anything was written through the connection since it was taken, so
// a snapshot never shows stale values (the host's lock keeps other
// processes out while the connection is open).
#pragma once

#include <cstdint>
#include <optional>
#include <utility>

#include "tarnctl/store/db.h"

namespace TarnCtl::Store {

template <typename Row>
class Snapshot {
 public:
  Snapshot() = default;
  Snapshot(const Db& db, Row row) { Set(db, std::move(row)); }

  // The row; `fetch()` reads it again when the copy may be stale.
  template <typename Fetch>
  const Row& Get(const Db& db, Fetch fetch) {
    if (!row_ || count_ != db.ChangeCount()) Set(db, fetch());
    return *row_;
  }
  void Set(const Db& db, Row row) {
    row_ = std::move(row);
    count_ = db.ChangeCount();
  }

 private:
  std::optional<Row> row_;
  int64_t count_ = -1;
};

}  // namespace TarnCtl::Store
