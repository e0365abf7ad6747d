#include "tarnctl/faults.h"

#include <algorithm>
#include <memory>

#include "tarnctl/session.h"

namespace TarnCtl::Detail {

using HostCtl::Lib::HostCtlException;

namespace {

struct FaultRow {
  int64_t id = 0;
  std::string operation;
  std::optional<std::string> target;
  std::string message;
  std::string detail;
  int64_t skip = 0;
  int64_t times = 0;
};

struct FaultCache {
  std::weak_ptr<Session> owner;
  int64_t changeCount = -1;
  std::vector<FaultRow> rows;
};

FaultCache& Cache() {
  static FaultCache cache;
  return cache;
}

std::vector<FaultRow> Load(Session& session) {
  std::vector<FaultRow> rows;
  Statement select = session.Prepare(
      "SELECT id, operation, target, message, detail, skip, times FROM fault ORDER BY id");
  while (select.Step()) {
    FaultRow row;
    row.id = select.Int(0);
    row.operation = select.Text(1);
    if (!select.IsNull(2)) row.target = select.Text(2);
    row.message = select.Text(3);
    row.detail = select.Text(4);
    row.skip = select.Int(5);
    row.times = select.Int(6);
    rows.push_back(std::move(row));
  }
  return rows;
}

// The rows of `session`'s host, read again when they may have changed.
std::vector<FaultRow>& Rows(Session& session) {
  FaultCache& cache = Cache();
  const auto current = Session::Current();
  if (current.get() != &session) {
    // A session that is not the process's (none is) is not cached.
    static std::vector<FaultRow> uncached;
    uncached = Load(session);
    return uncached;
  }
  if (cache.owner.lock() != current || cache.changeCount != session.ChangeCount()) {
    cache.rows = Load(session);
    cache.owner = current;
    cache.changeCount = session.ChangeCount();
  }
  return cache.rows;
}

bool Matches(const FaultRow& row, const std::string& operation,
             const std::vector<std::string>& names) {
  if (row.operation != operation || (row.skip <= 0 && row.times <= 0)) return false;
  return !row.target || std::find(names.begin(), names.end(), *row.target) != names.end();
}

}  // namespace

std::optional<HostCtlException> TakeFault(Session& session, const std::string& operation,
                                          const std::vector<std::string>& names) {
  std::vector<FaultRow>& rows = Rows(session);
  const auto row = std::find_if(rows.begin(), rows.end(), [&](const FaultRow& candidate) {
    return Matches(candidate, operation, names);
  });
  if (row == rows.end()) return std::nullopt;

  const bool fails = row->skip <= 0;
  {
    Transaction transaction(session);
    if (!fails) {
      session.Prepare("UPDATE fault SET skip = skip - 1 WHERE id = ?").Bind(1, row->id).Run();
    } else if (row->times > 1) {
      session.Prepare("UPDATE fault SET times = times - 1 WHERE id = ?").Bind(1, row->id).Run();
    } else {
      session.Prepare("DELETE FROM fault WHERE id = ?").Bind(1, row->id).Run();
    }
    transaction.Commit();
  }
  (fails ? row->times : row->skip) -= 1;
  if (Cache().owner.lock().get() == &session) Cache().changeCount = session.ChangeCount();
  if (!fails) return std::nullopt;

  const std::string message =
      row->message.empty() ? "Injected failure of " + operation : row->message;
  const std::string detail = row->detail.empty() ? operation + ": " + message : row->detail;
  return HostCtlException(message, detail);
}

}  // namespace TarnCtl::Detail
