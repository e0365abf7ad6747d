#include "tarnctl/store/faults.h"

#include <type_traits>

#include "hostctl/join.h"
#include "tarnctl/store/db.h"

namespace TarnCtl::Store::Faults {

using HostCtl::Text::Join;

namespace {

// The table's columns from the one description, as "a, b, c".
std::string Columns(bool withId) {
  const Row none;
  std::vector<const char*> columns;
  VisitFields(none, [&](const Field& field, const auto&) {
    if (withId || field.value != Value::kId) columns.push_back(field.column);
  });
  return Join(columns, ", ");
}

}  // namespace

std::vector<Row> List(Db& db) {
  static const std::string sql = "SELECT " + Columns(true) + " FROM fault ORDER BY id";
  std::vector<Row> rows;
  auto select = db.Prepare(sql);
  while (select.Step()) {
    Row row;
    int column = 0;
    VisitFields(row, [&](const Field&, auto& member) {
      using T = std::remove_reference_t<decltype(member)>;
      if constexpr (std::is_same_v<T, std::string>) {
        member = select.Text(column);
      } else if constexpr (std::is_same_v<T, std::optional<std::string>>) {
        if (!select.IsNull(column)) member = select.Text(column);
      } else {
        member = static_cast<T>(select.Int(column));
      }
      ++column;
    });
    rows.push_back(std::move(row));
  }
  return rows;
}

int64_t Insert(Db& db, const Row& row) {
  static const std::string sql = [] {
    const std::vector<const char*> places(kFieldCount - 1, "?");  // all but the id
    return "INSERT INTO fault(" + Columns(false) + ") VALUES (" + Join(places, ", ") +
           ") RETURNING id";
  }();
  auto insert = db.Prepare(sql);
  int place = 0;
  VisitFields(row, [&](const Field& field, const auto& member) {
    using T = std::remove_cvref_t<decltype(member)>;
    if (field.value == Value::kId) return;
    ++place;
    if constexpr (std::is_same_v<T, std::string>) {
      insert.Bind(place, member);
    } else if constexpr (std::is_same_v<T, std::optional<std::string>>) {
      if (member) {
        insert.Bind(place, *member);
      } else {
        insert.BindNull(place);
      }
    } else {
      insert.Bind(place, static_cast<int64_t>(member));
    }
  });
  insert.Step();
  const int64_t id = insert.Int(0);
  insert.Run();
  return id;
}

void UseSkip(Db& db, int64_t id) {
  db.Prepare("UPDATE fault SET skip = skip - 1 WHERE id = ?").Bind(1, id).Run();
}

void Fire(Db& db, int64_t id) {
  db.Prepare(
        "UPDATE fault SET fired = fired + 1, times = times - (always = 0 AND times > 0)"
        " WHERE id = ?")
      .Bind(1, id)
      .Run();
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
