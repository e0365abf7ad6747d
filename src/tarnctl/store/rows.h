// Whole tables row by row, for copying a host out and in (the dump). The
// caller describes a table by its name, its columns and its row order; the
// values travel as integers, texts or nulls.
#pragma once

#include <cstdint>
#include <functional>
#include <string>
#include <variant>
#include <vector>

namespace TarnCtl::Store {
class Db;
}

namespace TarnCtl::Store::Rows {

using Value = std::variant<std::monostate, int64_t, std::string>;

struct Shape {
  const char* table;
  std::vector<const char*> columns;
  const char* order;  // an ORDER BY list of column names
};

// Calls `each` with every row's values, in the shape's order.
void Scan(Db& db, const Shape& shape, const std::function<void(const std::vector<Value>&)>& each);

// Inserts rows of one shape one after the other, the statement prepared
// once (a load inserts many).
class Inserter {
 public:
  Inserter(Db& db, const Shape& shape);
  // False when a row with its key is there already.
  bool Insert(const std::vector<Value>& values);

 private:
  Db& db_;
  std::string sql_;
};
void Clear(Db& db, const Shape& shape);
// Turns every negative value -k of `column` into base + k: placeholders
// for values that are assigned once all rows are in.
void AssignPlaceholders(Db& db, const Shape& shape, const char* column, int64_t base);
int64_t Count(Db& db, const Shape& shape);

}  // namespace TarnCtl::Store::Rows
