#include "tarnctl/store/faults.h"

#include "tarnctl/store/db.h"

namespace TarnCtl::Store::Faults {

std::vector<Row> List(Db& db) {
  std::vector<Row> rows;
  auto select = db.Prepare(
      "SELECT id, operation, target, message, detail, skip, times FROM fault ORDER BY id");
  while (select.Step()) {
    Row row;
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

int64_t Insert(Db& db, const Row& row) {
  auto insert = db.Prepare(
      "INSERT INTO fault(operation, target, message, detail, skip, times)"
      " VALUES (?, ?, ?, ?, ?, ?) RETURNING id");
  insert.Bind(1, row.operation);
  if (row.target) {
    insert.Bind(2, *row.target);
  } else {
    insert.BindNull(2);
  }
  insert.Bind(3, row.message).Bind(4, row.detail).Bind(5, row.skip).Bind(6, row.times);
  insert.Step();
  const int64_t id = insert.Int(0);
  insert.Run();
  return id;
}

void UseSkip(Db& db, int64_t id) {
  db.Prepare("UPDATE fault SET skip = skip - 1 WHERE id = ?").Bind(1, id).Run();
}

void UseTime(Db& db, int64_t id) {
  db.Prepare("UPDATE fault SET times = times - 1 WHERE id = ?").Bind(1, id).Run();
  db.Prepare("DELETE FROM fault WHERE id = ? AND times <= 0").Bind(1, id).Run();
}

bool Delete(Db& db, int64_t id) {
  auto remove = db.Prepare("DELETE FROM fault WHERE id = ? RETURNING 1");
  bool deleted = false;
  remove.Bind(1, id);
  while (remove.Step()) deleted = true;
  return deleted;
}

void Clear(Db& db) {
  db.Exec("DELETE FROM fault");
}

}  // namespace TarnCtl::Store::Faults
