// Loading a dump (writer.cc describes the format) into the host.
//
// The document is read in one pass (simdjson's on-demand parser: the
// structure and the scalars are read where they stand) and each row is
// inserted as soon as it is read, so a large host is never held twice. A
// row's teaming policy is read by the store's policy reader, over this
// parser. Keys may come in any order, tables may be left out (they are
// empty), and a row may leave out its "seq" (or a fault its "id"): those
// are assigned in file order after every row is in, and meta's "next_seq"
// and "ens_node" are inferred when absent; a column that older dumps lack
// takes its default. Every value is held to the rule the library applies
// to it (the catalogue names each, and the rules between a row's fields),
// and the whole host to the library's invariants; the first fault found is
// refused naming its table, row and field, and the host is left as it was
// (the load is one transaction).
#include <algorithm>
#include <map>
#include <optional>
#include <set>
#include <string>
#include <vector>

#include <simdjson.h>

#include "tarnctl/admin/dump/catalogue.h"
#include "tarnctl/admin/host.h"
#include "tarnctl/admin/whole_host.h"
#include "tarnctl/instrument/call.h"
#include "tarnctl/instrument/errors.h"
#include "tarnctl/model/invariants.h"
#include "tarnctl/model/names.h"
#include "tarnctl/model/teaming.h"
#include "tarnctl/store/meta.h"
#include "tarnctl/store/policy_codec.h"
#include "tarnctl/store/teaming_fields.h"
#include "tarnctl/store/transaction.h"

namespace TarnCtl::Admin {

namespace {

using Dump::Column;
using Dump::Kind;
using Dump::Table;
using HostCtl::Lib::HostCtlException;
using Store::Rows::Value;

[[noreturn]] void Bad(const std::string& why) {
  throw Instrument::Refused("Cannot load dump: " + why);
}

std::string Quote(const std::string& text) {
  return "\"" + text + "\"";
}

std::string FromHex(const std::string& hex, bool& ok) {
  auto digit = [](char c) -> int {
    if (c >= '0' && c <= '9') return c - '0';
    if (c >= 'a' && c <= 'f') return c - 'a' + 10;
    return -1;
  };
  std::string out;
  ok = hex.size() % 2 == 0;
  for (size_t i = 0; ok && i < hex.size(); i += 2) {
    const int hi = digit(hex[i]), lo = digit(hex[i + 1]);
    ok = hi >= 0 && lo >= 0;
    out += static_cast<char>(hi * 16 + lo);
  }
  return out;
}

namespace ondemand = simdjson::ondemand;

[[noreturn]] void NotJson(simdjson::error_code error) {
  Bad(std::string("not valid JSON: ") + simdjson::error_message(error));
}

// The value of a simdjson result, or the refusal of a document that is not
// JSON.
template <typename T, typename Result>
T Must(Result&& result) {
  T value;
  if (const auto error = std::forward<Result>(result).get(value)) NotJson(error);
  return value;
}

const char* TypeName(ondemand::json_type type) {
  switch (type) {
    case ondemand::json_type::array:
      return "an array";
    case ondemand::json_type::object:
      return "an object";
    case ondemand::json_type::number:
      return "a number";
    case ondemand::json_type::string:
      return "a string";
    case ondemand::json_type::boolean:
      return "a boolean";
    case ondemand::json_type::null:
      return "null";
  }
  return "a value";
}

class Loader {
 public:
  Loader(Store::Db& db, const Progress& progress) : db_(db), progress_(progress) {}

  void Read(const std::string& text) {
    static_assert(kLoadRoom >= simdjson::SIMDJSON_PADDING);
    // The parser reads up to simdjson::SIMDJSON_PADDING bytes past the text.
    std::optional<simdjson::padded_string> copy;
    if (text.capacity() - text.size() < simdjson::SIMDJSON_PADDING) copy.emplace(text);
    const simdjson::padded_string_view padded =
        copy ? simdjson::padded_string_view(*copy) : simdjson::padded_string_view(text);
    ondemand::parser parser;
    auto document = Must<ondemand::document>(parser.iterate(padded));
    const auto type = Must<ondemand::json_type>(document.type());
    if (type != ondemand::json_type::object) {
      Bad(std::string("a dump is a JSON object, not ") + TypeName(type));
    }
    for (auto field : Must<ondemand::object>(document.get_object())) {
      const std::string key(Must<std::string_view>(field.unescaped_key()));
      if (key != "format" && key != "version" && key != "tables") Bad("unknown key " + Quote(key));
      if (!topKeys_.insert(key).second) Bad("key " + Quote(key) + " appears twice");
      ondemand::value value = Must<ondemand::value>(field.value());
      if (key == "format") {
        std::string_view format;
        if (value.get_string().get(format) || format != Dump::kFormat) {
          Bad("\"format\" must be " + Quote(Dump::kFormat));
        }
      } else if (key == "version") {
        int64_t version = 0;
        if (value.get_int64().get(version)) Bad("\"version\" must be an integer");
        if (version != Dump::kVersion) {
          Bad("unsupported version " + std::to_string(version) + " (this host reads version " +
              std::to_string(Dump::kVersion) + ")");
        }
      } else {
        ReadTables(value);
      }
    }
    // At the end, the document has no current location.
    const char* rest = nullptr;
    if (!document.current_location().get(rest)) NotJson(simdjson::TRAILING_CONTENT);
  }

  // After the last row: what depends on every row.
  void Finish() {
    for (const char* key : {"format", "version", "tables"}) {
      if (!topKeys_.count(key)) Bad("key " + Quote(key) + " is missing");
    }
    AssignCounters();
    FinishMeta();
    if (const auto violation = Model::FirstViolation(db_)) Bad(*violation);
  }

 private:
  void ReadTables(ondemand::value& value) {
    const auto type = Must<ondemand::json_type>(value.type());
    if (type != ondemand::json_type::object) {
      Bad(std::string("\"tables\" must be an object, not ") + TypeName(type));
    }
    for (auto field : Must<ondemand::object>(value.get_object())) {
      const std::string name(Must<std::string_view>(field.unescaped_key()));
      table_ = Dump::FindTable(name);
      if (table_ == nullptr) Bad("unknown table " + Quote(name));
      if (!seenTables_.insert(name).second) Bad("table " + Quote(name) + " appears twice");
      auto& inserter = inserters_.try_emplace(table_->name, db_, table_->Shape()).first->second;
      ondemand::value rows = Must<ondemand::value>(field.value());
      const auto rowsType = Must<ondemand::json_type>(rows.type());
      if (rowsType != ondemand::json_type::array) {
        Bad("table " + Quote(name) + " must be an array, not " + TypeName(rowsType));
      }
      rowNumber_ = 0;
      for (auto element : Must<ondemand::array>(rows.get_array())) {
        ondemand::value row = Must<ondemand::value>(std::move(element));
        const auto rowType = Must<ondemand::json_type>(row.type());
        if (rowType != ondemand::json_type::object) {
          Bad("rows of table " + Quote(name) + " must be objects, not " + TypeName(rowType));
        }
        ReadRow(Must<ondemand::object>(row.get_object()), inserter);
      }
    }
  }

  [[noreturn]] void BadField(const char* field, const std::string& why) {
    Bad("table " + Quote(table_->name) + ", row " + std::to_string(rowNumber_) + ", field " +
        Quote(field) + ": " + why);
  }
  [[noreturn]] void BadField(const Column& c, const std::string& why) { BadField(c.name, why); }

  // Runs a model rule on a field's value, naming the field when it refuses.
  template <typename Rule>
  void Apply(const char* field, Rule rule) {
    try {
      rule();
    } catch (const HostCtlException& refusal) {
      BadField(field, Reason(refusal));
    }
  }
  template <typename Rule>
  void Apply(const Column& c, Rule rule) {
    Apply(c.name, rule);
  }

  // A text field: a string, or {"hex": "<bytes in hex>"}.
  std::string TextField(const Column& c, ondemand::value& v) {
    const auto type = Must<ondemand::json_type>(v.type());
    if (type == ondemand::json_type::string) {
      return std::string(Must<std::string_view>(v.get_string()));
    }
    ondemand::object object;
    std::string_view hex;
    size_t fields = 0;
    if (type != ondemand::json_type::object || v.get_object().get(object) ||
        object.count_fields().get(fields) || fields != 1 ||
        object.find_field_unordered("hex").get_string().get(hex)) {
      BadField(c, "must be a string");
    }
    bool ok = false;
    std::string text = FromHex(std::string(hex), ok);
    if (!ok) BadField(c, "its \"hex\" text is not pairs of lower-case hex digits");
    return text;
  }

  std::vector<std::string> NamesField(const Column& c, ondemand::value& v) {
    ondemand::array array;
    if (v.get_array().get(array)) BadField(c, "must be an array of names");
    std::vector<std::string> names;
    std::set<std::string> seen;
    for (auto element : array) {
      ondemand::value name = Must<ondemand::value>(std::move(element));
      names.push_back(TextField(c, name));
      Apply(c, [&] { Model::CheckName(Model::NameKind::kPnic, names.back()); });
      if (!seen.insert(names.back()).second) BadField(c, "names " + names.back() + " twice");
    }
    return names;
  }

  // A value of the document as Store::ReadTeamingPolicy reads it; its
  // refusals name the row's field.
  class PolicyNode {
   public:
    PolicyNode() = default;
    PolicyNode(Loader& loader, const Column& c, ondemand::value value)
        : loader_(&loader), column_(&c), value_(value) {}

    bool Object(size_t& fields) {
      return !value_.get_object().get(object_) && !object_.count_fields().get(fields);
    }
    bool Field(const char* key, PolicyNode& field) {
      ondemand::value value;
      if (object_.find_field_unordered(key).get(value)) return false;
      field = PolicyNode(*loader_, *column_, value);
      return true;
    }
    bool Int64(int64_t& number) { return !value_.get_int64().get(number); }
    bool Uint64(uint64_t& number) { return !value_.get_uint64().get(number); }
    bool Names(std::vector<std::string>& names) {
      ondemand::array array;
      if (value_.get_array().get(array)) return false;
      for (auto element : array) {
        ondemand::value name = Must<ondemand::value>(std::move(element));
        names.push_back(loader_->TextField(*column_, name));
      }
      return true;
    }
    [[noreturn]] void Fail(const std::string& why) { loader_->BadField(*column_, why); }

   private:
    Loader* loader_ = nullptr;
    const Column* column_ = nullptr;
    ondemand::value value_;
    ondemand::object object_;
  };

  Value ValueOf(const Column& c, ondemand::value& v) {
    switch (c.kind) {
      case Kind::kInt: {
        int64_t number = 0;
        if (const auto error = v.get_int64().get(number)) {
          BadField(c,
                   error == simdjson::NUMBER_OUT_OF_RANGE ? "is too large" : "must be an integer");
        }
        Apply(c, [&] { Model::Check(*c.range, number); });
        return number;
      }
      case Kind::kOptText:
        if (Must<bool>(v.is_null())) return std::monostate{};
        [[fallthrough]];
      case Kind::kText: {
        std::string text = TextField(c, v);
        if (c.name_rule) Apply(c, [&] { Model::CheckName(*c.name_rule, text); });
        if (c.rule != nullptr) Apply(c, [&] { c.rule(text); });
        return text;
      }
      case Kind::kPolicy: {
        // The rows of a host share a few policies: each text is read once.
        ondemand::object object;
        std::string_view raw;
        if (v.get_object().get(object) || object.raw_json().get(raw)) {
          BadField(c, "must be an object");
        }
        auto known = policies_.find(raw);
        if (known == policies_.end()) known = policies_.emplace(raw, ReadPolicy(c, raw)).first;
        return known->second;
      }
      case Kind::kNames:
        return Store::EncodeNameList(NamesField(c, v));
    }
    return std::monostate{};
  }

  // The stored form of the policy whose JSON text is `raw`, checked.
  std::string ReadPolicy(const Column& c, std::string_view raw) {
    const simdjson::padded_string text(raw);
    auto document = Must<ondemand::document>(policyParser_.iterate(text));
    auto value = Must<ondemand::value>(document.get_value());
    const auto policy =
        Store::ReadTeamingPolicy(PolicyNode(*this, c, value), Store::PolicyForm::kFull);
    Apply(c, [&] { Model::CheckTeamingPolicy(policy); });
    return Store::EncodeTeamingPolicy(policy);
  }

  void ReadRow(ondemand::object row, Store::Rows::Inserter& inserter) {
    ++rowNumber_;
    const Table& t = *table_;
    std::vector<Value> values(t.columns.size());
    std::vector<bool> given(t.columns.size());
    for (auto field : row) {
      const std::string_view key = Must<std::string_view>(field.unescaped_key());
      size_t i = 0;
      while (i < t.columns.size() && key != t.columns[i].name) ++i;
      if (i == t.columns.size()) {
        Bad("table " + Quote(t.name) + ", row " + std::to_string(rowNumber_) + ": unknown field " +
            Quote(std::string(key)));
      }
      if (given[i]) Bad("field " + Quote(std::string(key)) + " appears twice");
      given[i] = true;
      ondemand::value value = Must<ondemand::value>(field.value());
      values[i] = ValueOf(t.columns[i], value);
    }
    Counter* counter = t.counter != nullptr ? &counters_[&t] : nullptr;
    for (size_t i = 0; i < t.columns.size(); ++i) {
      const Column& c = t.columns[i];
      const bool isCounter = counter != nullptr && std::string_view(c.name) == t.counter;
      if (given[i]) {
        if (isCounter) counter->given = std::max(counter->given, std::get<int64_t>(values[i]));
        continue;
      }
      if (c.absent) {
        values[i] = *c.absent;
        continue;
      }
      if (!isCounter) BadField(c, "is missing");
      values[i] = -++placeholders_;  // a placeholder, assigned in Finish()
      counter->lastPlaceholder = placeholders_;
    }
    for (const Dump::RowRule& rule : t.rules) {
      Apply(rule.field, [&] { rule.check(Dump::Fields(t, values)); });
    }
    if (!inserter.Insert(values)) {
      Bad("table " + Quote(t.name) + ", row " + std::to_string(rowNumber_) +
          ": repeats the key of an earlier row");
    }
    if (progress_ && ++rows_ % 4096 == 0) progress_(rows_, 0);
  }

  // Counters left out: seq values go after the largest given one (and
  // after a given next_seq), fault ids after the largest given id; then the
  // ordering counter goes beyond every seq.
  void AssignCounters() {
    const auto next = NextSeqGiven();
    int64_t given = 0;
    for (const Table& t : Dump::Tables()) {
      if (t.CountsSeq()) given = std::max(given, counters_[&t].given);
    }
    if (next && *next <= given) {
      Bad("meta key \"next_seq\" (" + std::to_string(*next) + ") is not beyond the largest seq (" +
          std::to_string(given) + ")");
    }
    const int64_t base = next ? *next - 1 : given;
    int64_t maxSeq = 0;
    for (const Table& t : Dump::Tables()) {
      if (t.counter == nullptr) continue;
      const Counter& counter = counters_[&t];
      const int64_t from = t.CountsSeq() ? base : counter.given;
      int64_t largest = counter.given;
      if (counter.lastPlaceholder > 0) {
        Store::Rows::AssignPlaceholders(db_, t.Shape(), t.counter, from);
        largest = std::max(largest, from + counter.lastPlaceholder);
      }
      if (t.CountsSeq()) maxSeq = std::max(maxSeq, largest);
    }
    if (!Model::Within(Model::kSeq, maxSeq + 1)) {
      Bad("the largest seq (" + std::to_string(maxSeq) + ") leaves no room for the counter");
    }
    const int64_t counter = next ? std::max(*next, maxSeq + 1) : maxSeq + 1;
    Store::Meta::SetValue(db_, Dump::kNextSeqKey, std::to_string(counter));
  }

  // The next_seq the document gives, checked; nothing when it gives none.
  std::optional<int64_t> NextSeqGiven() {
    const auto next = Store::Meta::Value(db_, Dump::kNextSeqKey);
    if (!next) return std::nullopt;
    const std::string& text = *next;
    size_t used = 0;
    int64_t value = 0;
    try {
      value = std::stoll(text, &used);
    } catch (const std::exception&) {
      used = 0;
    }
    if (text.empty() || used != text.size() || !Model::Within(Model::kSeq, value)) {
      Bad("meta key \"next_seq\" must be a number from 1 to " + std::to_string(Model::kSeq.max) +
          ", not " + Quote(text));
    }
    return value;
  }

  void FinishMeta() {
    const auto ens = Store::Meta::Value(db_, Dump::kEnsNodeKey);
    if (!ens) {
      Store::Meta::SetValue(db_, Dump::kEnsNodeKey, "0");
    } else if (*ens != "0" && *ens != "1") {
      Bad("meta key \"ens_node\" must be \"0\" or \"1\", not " + Quote(*ens));
    }
  }

  Store::Db& db_;
  const Progress& progress_;
  std::set<std::string> topKeys_;
  std::set<std::string> seenTables_;
  const Table* table_ = nullptr;
  int64_t rowNumber_ = 0;
  int64_t rows_ = 0;
  int64_t placeholders_ = 0;
  // Of a table's counter column: the largest value given, and the largest
  // placeholder that stands for a value left out (0: none).
  struct Counter {
    int64_t given = 0;
    int64_t lastPlaceholder = 0;
  };
  std::map<const Table*, Counter> counters_;
  std::map<std::string, Store::Rows::Inserter> inserters_;
  ondemand::parser policyParser_;
  std::map<std::string, std::string, std::less<>> policies_;  // JSON text, stored form
};

}  // namespace

void LoadHost(Store::Db& db, const std::string& text, const Progress& progress) {
  Instrument::Scope scope(db, "Load");
  db.PrepareBulkChange();
  Store::Transaction transaction(db);
  for (const auto& table : Dump::Tables()) Store::Rows::Clear(db, table.Shape());
  Loader loader(db, progress);
  loader.Read(text);
  loader.Finish();
  transaction.Commit();
}

}  // namespace TarnCtl::Admin
