#include "tarnctl/store/rows.h"

#include "hostctl/join.h"
#include "tarnctl/store/db.h"

namespace TarnCtl::Store::Rows {

using HostCtl::Text::Join;

namespace {

int64_t Single(Db& db, const std::string& sql) {
  auto select = db.Prepare(sql);
  return select.Step() ? select.Int(0) : 0;
}

// A row whose key is there already is left out.
std::string InsertSql(const Shape& shape) {
  const std::vector<const char*> marks(shape.columns.size(), "?");
  return "INSERT OR IGNORE INTO " + std::string(shape.table) + "(" + Join(shape.columns, ", ") +
         ") VALUES (" + Join(marks, ", ") + ")";
}

// Runs `sql` with `values`: whether a row went in.
bool InsertValues(Db& db, const std::string& sql, const std::vector<Value>& values) {
  auto insert = db.Prepare(sql);
  for (size_t i = 0; i < values.size(); ++i) {
    const int index = static_cast<int>(i) + 1;
    if (const auto* number = std::get_if<int64_t>(&values[i])) {
      insert.Bind(index, *number);
    } else if (const auto* text = std::get_if<std::string>(&values[i])) {
      insert.BindView(index, *text);
    } else {
      insert.BindNull(index);
    }
  }
  insert.Run();
  return db.LastChanges() > 0;
}

}  // namespace

void Scan(Db& db, const Shape& shape, const std::function<void(const std::vector<Value>&)>& each) {
  auto select = db.Prepare("SELECT " + Join(shape.columns, ", ") + " FROM " + shape.table +
                           " ORDER BY " + shape.order);
  std::vector<Value> values(shape.columns.size());
  while (select.Step()) {
    for (size_t i = 0; i < values.size(); ++i) {
      const int column = static_cast<int>(i);
      if (select.IsNull(column)) {
        values[i] = std::monostate{};
      } else if (select.IsInteger(column)) {
        values[i] = select.Int(column);
      } else {
        values[i] = select.Text(column);
      }
    }
    each(values);
  }
}

Inserter::Inserter(Db& db, const Shape& shape) : db_(db), sql_(InsertSql(shape)) {}

bool Inserter::Insert(const std::vector<Value>& values) {
  return InsertValues(db_, sql_, values);
}

void Clear(Db& db, const Shape& shape) {
  db.Exec(std::string("DELETE FROM ") + shape.table);
}

void AssignPlaceholders(Db& db, const Shape& shape, const char* column, int64_t base) {
  db.Prepare(std::string("UPDATE ") + shape.table + " SET " + column + " = ? - " + column +
             " WHERE " + column + " < 0")
      .Bind(1, base)
      .Run();
}

int64_t Count(Db& db, const Shape& shape) {
  return Single(db, std::string("SELECT count(*) FROM ") + shape.table);
}

}  // namespace TarnCtl::Store::Rows
