// The tables of a dump: every table of the host, its columns in order, how
// each column appears in the dump, and the rule its values obey (the
// library's own rules, from the model layer).
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "tarnctl/model/limits.h"
#include "tarnctl/model/names.h"
#include "tarnctl/store/rows.h"

namespace TarnCtl::Admin::Dump {

enum class Kind {
  kInt,      // an integer within `range`
  kText,     // a text; a name when `name` is set
  kOptText,  // the same, or null
  kPolicy,   // a teaming policy, in full (stored form in the database)
  kNames,    // a list of pnic names (JSON array text in the database)
};

// Checks a text value beyond its kind (a UUID, a word from a list).
using TextRule = void (*)(const std::string& value);

struct Column {
  const char* name;
  Kind kind;
  const Model::Range* range = nullptr;       // kInt
  std::optional<Model::NameKind> name_rule;  // kText, kOptText
  TextRule rule = nullptr;                   // kText
  // A kInt column that older dumps lack: the value a row without it takes.
  std::optional<int64_t> absent = std::nullopt;
};

struct Table;

// A row's values, by column name.
class Fields {
 public:
  Fields(const Table& table, const std::vector<Store::Rows::Value>& values)
      : table_(table), values_(values) {}
  int64_t Int(const char* column) const;

 private:
  const Table& table_;
  const std::vector<Store::Rows::Value>& values_;
};

// A rule between the fields of one row. It refuses as the model's rules
// do, and the refusal names `field`.
struct RowRule {
  const char* field;
  void (*check)(const Fields& row);
};

struct Table {
  const char* name;
  const char* order;  // the rows' order in a dump, as column names
  std::vector<Column> columns;
  // The column that draws from the ordering counter ("seq"), or the
  // fault's "id": assigned in file order when a row leaves it out.
  const char* counter = nullptr;
  std::vector<RowRule> rules = {};

  Store::Rows::Shape Shape() const;
  // Whether `counter` draws from the ordering counter (the host's next_seq).
  bool CountsSeq() const;
};

// Every table, in dump order.
const std::vector<Table>& Tables();
const Table* FindTable(const std::string& name);

inline constexpr const char* kFormat = "tarnhost-dump";
inline constexpr int64_t kVersion = 1;

// The meta keys a host has.
inline constexpr const char* kNextSeqKey = "next_seq";
inline constexpr const char* kEnsNodeKey = "ens_node";

}  // namespace TarnCtl::Admin::Dump
