#include "tarnctl/store/timeouts.h"

#include "tarnctl/store/db.h"

namespace TarnCtl::Store::Timeouts {

namespace {

// ?1 portset, ?2 LAG id, ?3 uplink.
#define TARN_UPLINK_FILTER \
  " AND (?1 = '' OR portset = ?1) AND (?2 = 0 OR lag_id = ?2) AND (?3 = '' OR uplink = ?3)"
#define TARN_LAG_FILTER " AND (?1 = '' OR portset = ?1) AND (?2 = 0 OR lag_id = ?2)"

Statement& BindUplink(Statement& statement, const Uplink& filter) {
  return statement.Bind(1, filter.portsetName).Bind(2, filter.lagId).Bind(3, filter.uplinkName);
}

Statement& BindLag(Statement& statement, const Lag& filter) {
  return statement.Bind(1, filter.portsetName).Bind(2, filter.lagId);
}

// Runs an "... RETURNING 1" statement to its end: whether it touched a row.
bool TouchedOne(Statement& statement) {
  bool touched = false;
  while (statement.Step()) touched = true;
  return touched;
}

}  // namespace

void LoadUplinks(Db& db, const Uplink& filter) {
  for (const char* sql : {"DELETE FROM uplink_timeout WHERE layer = 1" TARN_UPLINK_FILTER,
                          "INSERT INTO uplink_timeout(layer, portset, uplink, lag_id, timeout)"
                          " SELECT 1, portset, uplink, lag_id, timeout FROM uplink_timeout"
                          " WHERE layer = 0" TARN_UPLINK_FILTER}) {
    auto statement = db.Prepare(sql);
    BindUplink(statement, filter).Run();
  }
}

void LoadLags(Db& db, const Lag& filter) {
  for (const char* sql : {"DELETE FROM lag_timeout WHERE layer = 1" TARN_LAG_FILTER,
                          "INSERT INTO lag_timeout(layer, portset, lag_id, timeout)"
                          " SELECT 1, portset, lag_id, timeout FROM lag_timeout"
                          " WHERE layer = 0" TARN_LAG_FILTER}) {
    auto statement = db.Prepare(sql);
    BindLag(statement, filter).Run();
  }
}

std::vector<Uplink> Uplinks(Db& db, Layer layer, const Uplink& filter) {
  auto select = db.Prepare(
      "SELECT portset, uplink, lag_id, timeout FROM uplink_timeout WHERE layer = "
      "?4" TARN_UPLINK_FILTER " ORDER BY portset, uplink, lag_id");
  BindUplink(select, filter).Bind(4, LayerValue(layer));
  std::vector<Uplink> records;
  while (select.Step()) {
    records.push_back({select.Text(0), select.Text(1), static_cast<uint32_t>(select.Int(2)),
                       static_cast<uint8_t>(select.Int(3))});
  }
  return records;
}

std::vector<Lag> Lags(Db& db, Layer layer, const Lag& filter) {
  auto select =
      db.Prepare("SELECT portset, lag_id, timeout FROM lag_timeout WHERE layer = ?3" TARN_LAG_FILTER
                 " ORDER BY portset, lag_id");
  BindLag(select, filter).Bind(3, LayerValue(layer));
  std::vector<Lag> records;
  while (select.Step()) {
    records.push_back({select.Text(0), static_cast<uint32_t>(select.Int(1)),
                       static_cast<uint8_t>(select.Int(2))});
  }
  return records;
}

bool StoreUplink(Db& db, const Uplink& record) {
  auto insert = db.Prepare(
      "INSERT OR IGNORE INTO uplink_timeout(layer, portset, uplink, lag_id, timeout)"
      " VALUES (0, ?1, ?3, ?2, ?4) RETURNING 1");
  BindUplink(insert, record).Bind(4, record.timeout);
  return TouchedOne(insert);
}

bool StoreLag(Db& db, const Lag& record) {
  auto insert = db.Prepare(
      "INSERT OR IGNORE INTO lag_timeout(layer, portset, lag_id, timeout)"
      " VALUES (0, ?1, ?2, ?3) RETURNING 1");
  BindLag(insert, record).Bind(3, record.timeout);
  return TouchedOne(insert);
}

bool DeleteUplink(Db& db, Layer layer, const Uplink& key) {
  auto remove = db.Prepare(
      "DELETE FROM uplink_timeout WHERE layer = ?4 AND portset = ?1 AND lag_id = ?2"
      " AND uplink = ?3 RETURNING 1");
  BindUplink(remove, key).Bind(4, LayerValue(layer));
  return TouchedOne(remove);
}

bool DeleteLag(Db& db, Layer layer, const Lag& key) {
  auto remove = db.Prepare(
      "DELETE FROM lag_timeout WHERE layer = ?3 AND portset = ?1 AND lag_id = ?2 RETURNING 1");
  BindLag(remove, key).Bind(3, LayerValue(layer));
  return TouchedOne(remove);
}

#undef TARN_UPLINK_FILTER
#undef TARN_LAG_FILTER

}  // namespace TarnCtl::Store::Timeouts
