// A copy of one database row held by a library object. It is read again
// once anything was written through the session since it was taken, so a
// snapshot never shows stale values (the host's lock keeps other processes
// out while the session is open).
#pragma once

#include <optional>
#include <utility>

#include "tarnctl/session.h"

namespace TarnCtl::Detail {

template <typename Row>
class Snapshot {
 public:
  Snapshot() = default;
  Snapshot(Session& session, Row row) { Set(session, std::move(row)); }

  // The row; `fetch()` reads it again when the copy may be stale.
  template <typename Fetch>
  const Row& Get(Session& session, Fetch fetch) {
    if (!row_ || count_ != session.ChangeCount()) Set(session, fetch());
    return *row_;
  }
  void Set(Session& session, Row row) {
    row_ = std::move(row);
    count_ = session.ChangeCount();
  }

 private:
  std::optional<Row> row_;
  int64_t count_ = -1;
};

}  // namespace TarnCtl::Detail
