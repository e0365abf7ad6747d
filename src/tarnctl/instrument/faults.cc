#include "tarnctl/instrument/faults.h"

#include <algorithm>
#include <chrono>
#include <thread>

#include "tarnctl/instrument/errors.h"
#include "tarnctl/store/db.h"
#include "tarnctl/store/faults.h"
#include "tarnctl/store/transaction.h"

namespace TarnCtl::Instrument {

namespace {

// The faults of the last connection that asked, while they are current.
struct Cache {
  uint64_t serial = 0;
  int64_t changeCount = -1;
  std::vector<Store::Faults::Row> rows;
};

std::vector<Store::Faults::Row>& Rows(Store::Db& db) {
  static Cache cache;
  if (cache.serial != db.serial() || cache.changeCount != db.ChangeCount()) {
    cache.rows = Store::Faults::List(db);
    cache.serial = db.serial();
    cache.changeCount = db.ChangeCount();
  }
  return cache.rows;
}

bool Matches(const Store::Faults::Row& row, const char* operation,
             std::span<const std::string_view> names) {
  if (row.operation != operation || Store::Faults::Spent(row)) return false;
  if (!row.target) return true;
  for (const std::string_view name : names) {
    if (!name.empty() && name == *row.target) return true;
  }
  return false;
}

}  // namespace

std::optional<Fired> TakeFault(Store::Db& db, const char* operation,
                               std::span<const std::string_view> names) {
  const auto& rows = Rows(db);
  if (rows.empty()) return std::nullopt;
  const auto row = std::find_if(rows.begin(), rows.end(), [&](const auto& candidate) {
    return Matches(candidate, operation, names);
  });
  if (row == rows.end()) return std::nullopt;

  const Store::Faults::Row fault = *row;
  const bool fires = fault.skip <= 0;
  {
    Store::Transaction transaction(db);
    if (fires) {
      Store::Faults::Fire(db, fault.id);
    } else {
      Store::Faults::UseSkip(db, fault.id);
    }
    transaction.Commit();
  }
  if (!fires) return std::nullopt;
  if (fault.delayMs > 0) std::this_thread::sleep_for(std::chrono::milliseconds(fault.delayMs));
  if (fault.pass) return Fired{fault.id, std::nullopt};
  const std::string message =
      fault.message.empty() ? std::string(Store::Faults::kDefaultMessage) : fault.message;
  // A detail of the fault's own is the whole detailed message: no
  // operation's name leads it.
  if (!fault.detail.empty()) return Fired{fault.id, Refusal("", message, fault.detail)};
  return Fired{fault.id, Refusal(operation, message, message)};
}

}  // namespace TarnCtl::Instrument
