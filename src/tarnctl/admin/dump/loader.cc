// Loading a dump (writer.cc describes the format) into the host.
//
// The document is read as a stream of events and each row is inserted as
// soon as it is complete, so a large host is never held twice. Keys may
// come in any order, tables may be left out (they are empty), and a row may
// leave out its "seq" (or a fault its "id"): those are assigned in file
// order after every row is in, and meta's "next_seq" and "ens_node" are
// inferred when absent. Every value is held to the rule the library applies
// to it, and the whole host to the library's invariants; the first fault
// found is refused naming its table, row and field, and the host is left
// as it was (the load is one transaction).
#include <algorithm>
#include <map>
#include <optional>
#include <set>
#include <string>
#include <vector>

#include <nlohmann/json.hpp>

#include "tarnctl/admin/dump/catalogue.h"
#include "tarnctl/admin/host.h"
#include "tarnctl/admin/state.h"
#include "tarnctl/instrument/call.h"
#include "tarnctl/model/invariants.h"
#include "tarnctl/model/names.h"
#include "tarnctl/model/teaming.h"
#include "tarnctl/store/policy_codec.h"
#include "tarnctl/store/transaction.h"

namespace TarnCtl::Admin {

namespace {

using Dump::Column;
using Dump::Kind;
using Dump::Table;
using HostCtl::Lib::HostCtlException;
using Json = Store::Json;
using Store::Rows::Value;

[[noreturn]] void Bad(const std::string& why) {
  const std::string message = "Cannot load dump: " + why;
  throw HostCtlException(message, "Load: " + message);
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

// Builds one row's value from parse events (rows are small).
class RowBuilder {
 public:
  bool active() const { return !stack_.empty(); }
  Json& row() { return row_; }

  void Begin() {
    row_ = Json::object();
    stack_.assign(1, &row_);
  }
  void Key(std::string key) { key_ = std::move(key); }
  void Value(Json v) { Place(std::move(v)); }
  void Open(Json container) { stack_.push_back(Place(std::move(container))); }
  // True when the row itself was closed.
  bool Close() {
    stack_.pop_back();
    return stack_.empty();
  }

 private:
  Json* Place(Json v) {
    Json& top = *stack_.back();
    if (top.is_array()) {
      top.push_back(std::move(v));
      return &top.back();
    }
    if (top.contains(key_)) Bad("field " + Quote(key_) + " appears twice");
    return &(top[key_] = std::move(v));
  }

  Json row_;
  std::vector<Json*> stack_;
  std::string key_;
};

class Loader : public nlohmann::json_sax<Json> {
 public:
  Loader(Store::Db& db, const Progress& progress) : db_(db), progress_(progress) {}

  bool null() override { return Scalar(nullptr); }
  bool boolean(bool v) override { return Scalar(v); }
  bool number_integer(number_integer_t v) override { return Scalar(v); }
  bool number_unsigned(number_unsigned_t v) override { return Scalar(v); }
  bool number_float(number_float_t v, const string_t&) override { return Scalar(v); }
  bool string(string_t& v) override { return Scalar(v); }
  bool binary(binary_t&) override { Bad("binary values are not allowed"); }

  bool start_object(std::size_t) override {
    if (row_.active()) {
      row_.Open(Json::object());
    } else if (level_ == 0) {
      level_ = 1;
    } else if (level_ == 1 && topKey_ == "tables") {
      level_ = 2;
    } else if (level_ == 3) {
      row_.Begin();
    } else {
      Misplaced("an object");
    }
    return true;
  }

  bool start_array(std::size_t) override {
    if (row_.active()) {
      row_.Open(Json::array());
    } else if (level_ == 2) {
      level_ = 3;
      rowNumber_ = 0;
    } else {
      Misplaced("an array");
    }
    return true;
  }

  bool key(string_t& k) override {
    if (row_.active()) {
      row_.Key(k);
    } else if (level_ == 1) {
      if (k != "format" && k != "version" && k != "tables") Bad("unknown key " + Quote(k));
      if (!topKeys_.insert(k).second) Bad("key " + Quote(k) + " appears twice");
      topKey_ = k;
    } else {
      table_ = Dump::FindTable(k);
      if (table_ == nullptr) Bad("unknown table " + Quote(k));
      if (!seenTables_.insert(k).second) Bad("table " + Quote(k) + " appears twice");
    }
    return true;
  }

  bool end_object() override {
    if (row_.active()) {
      if (row_.Close()) InsertRow(row_.row());
    } else {
      level_ = level_ == 2 ? 1 : 0;
    }
    return true;
  }

  bool end_array() override {
    if (row_.active()) {
      row_.Close();
    } else {
      level_ = 2;
    }
    return true;
  }

  bool parse_error(std::size_t, const std::string&, const nlohmann::detail::exception& e) override {
    std::string what = e.what();
    if (auto pos = what.find("] "); pos != std::string::npos) what = what.substr(pos + 2);
    Bad("not valid JSON: " + what);
  }

  // After the last event: what depends on every row.
  void Finish() {
    for (const char* key : {"format", "version", "tables"}) {
      if (!topKeys_.count(key)) Bad("key " + Quote(key) + " is missing");
    }
    AssignCounters();
    FinishMeta();
    if (const auto violation = Model::FirstViolation(db_)) Bad(*violation);
  }

 private:
  bool Scalar(Json v) {
    if (row_.active()) {
      row_.Value(std::move(v));
    } else if (level_ == 1 && topKey_ == "format") {
      if (!v.is_string() || v.get<std::string>() != Dump::kFormat) {
        Bad("\"format\" must be " + Quote(Dump::kFormat));
      }
    } else if (level_ == 1 && topKey_ == "version") {
      if (!v.is_number_integer()) Bad("\"version\" must be an integer");
      if (!v.is_number_unsigned() || v.get<uint64_t>() != static_cast<uint64_t>(Dump::kVersion)) {
        Bad("unsupported version " + v.dump() + " (this host reads version " +
            std::to_string(Dump::kVersion) + ")");
      }
    } else {
      Misplaced(v.is_null() ? "null" : "a " + std::string(v.type_name()));
    }
    return true;
  }

  [[noreturn]] void Misplaced(const std::string& what) {
    if (level_ == 0) Bad("a dump is a JSON object, not " + what);
    if (level_ == 1) {
      Bad(Quote(topKey_) + " must be " + (topKey_ == "tables" ? "an object" : "a scalar") +
          ", not " + what);
    }
    if (level_ == 2) Bad("table " + Quote(table_->name) + " must be an array, not " + what);
    Bad("rows of table " + Quote(table_->name) + " must be objects, not " + what);
  }

  [[noreturn]] void BadField(const Column& c, const std::string& why) {
    Bad("table " + Quote(table_->name) + ", row " + std::to_string(rowNumber_) + ", field " +
        Quote(c.name) + ": " + why);
  }

  // Runs a model rule on a field's value, naming the field when it refuses.
  template <typename Rule>
  void Apply(const Column& c, Rule rule) {
    try {
      rule();
    } catch (const HostCtlException& refusal) {
      BadField(c, Reason(refusal));
    }
  }

  std::string TextOf(const Column& c, const Json& v) {
    if (v.is_string()) return v.get<std::string>();
    if (v.is_object() && v.size() == 1 && v.contains("hex") && v["hex"].is_string()) {
      bool ok = false;
      std::string text = FromHex(v["hex"].get<std::string>(), ok);
      if (!ok) BadField(c, "its \"hex\" text is not pairs of lower-case hex digits");
      return text;
    }
    BadField(c, "must be a string");
  }

  std::vector<std::string> NamesOf(const Column& c, const Json& v) {
    if (!v.is_array()) BadField(c, "must be an array of names");
    std::vector<std::string> names;
    std::set<std::string> seen;
    for (const auto& item : v) {
      names.push_back(TextOf(c, item));
      Apply(c, [&] { Model::CheckName(Model::NameKind::kPnic, names.back()); });
      if (!seen.insert(names.back()).second) BadField(c, "names " + names.back() + " twice");
    }
    return names;
  }

  Value ValueOf(const Column& c, const Json& v) {
    switch (c.kind) {
      case Kind::kInt: {
        if (!v.is_number_integer()) BadField(c, "must be an integer");
        if (v.is_number_unsigned() && v.get<uint64_t>() > uint64_t{INT64_MAX}) {
          BadField(c, "is too large");
        }
        const int64_t number = v.get<int64_t>();
        Apply(c, [&] { Model::Check(*c.range, number); });
        return number;
      }
      case Kind::kOptText:
        if (v.is_null()) return std::monostate{};
        [[fallthrough]];
      case Kind::kText: {
        std::string text = TextOf(c, v);
        if (c.name_rule) Apply(c, [&] { Model::CheckName(*c.name_rule, text); });
        if (c.rule != nullptr) Apply(c, [&] { c.rule(text); });
        return text;
      }
      case Kind::kPolicy: {
        Json policy = v;
        if (v.is_object() && v.contains("uplinkOrder") && v["uplinkOrder"].is_array()) {
          for (auto& name : policy["uplinkOrder"]) name = TextOf(c, name);
        }
        HostCtl::Network::NicTeamingPolicy decoded;
        try {
          decoded = Store::PolicyFromJson(policy, Store::PolicyForm::kFull);
        } catch (const Store::FormatError& e) {
          BadField(c, e.what());
        }
        Apply(c, [&] { Model::CheckTeamingPolicy(decoded); });
        return Store::EncodeTeamingPolicy(decoded);
      }
      case Kind::kNames:
        return Store::EncodeNameList(NamesOf(c, v));
    }
    return std::monostate{};
  }

  void InsertRow(const Json& row) {
    ++rowNumber_;
    const Table& t = *table_;
    for (const auto& item : row.items()) {
      bool known = false;
      for (const auto& c : t.columns) known = known || item.key() == c.name;
      if (!known) {
        Bad("table " + Quote(t.name) + ", row " + std::to_string(rowNumber_) + ": unknown field " +
            Quote(item.key()));
      }
    }
    std::vector<Value> values;
    for (const Column& c : t.columns) {
      if (!row.contains(c.name)) {
        if (t.counter == nullptr || std::string(c.name) != t.counter) BadField(c, "is missing");
        // A placeholder, assigned in Finish().
        values.emplace_back(std::in_place_type<int64_t>, -++placeholders_);
        continue;
      }
      values.push_back(ValueOf(c, row[c.name]));
    }
    CheckRow(t, values);
    if (!Store::Rows::Insert(db_, t.Shape(), values)) {
      Bad("table " + Quote(t.name) + ", row " + std::to_string(rowNumber_) +
          ": repeats the key of an earlier row");
    }
    if (progress_ && ++rows_ % 4096 == 0) progress_(rows_, 0);
  }

  // Rules between the fields of one row.
  void CheckRow(const Table& t, const std::vector<Value>& values) {
    if (std::string(t.name) == "opaque") {
      const int64_t ports = std::get<int64_t>(values[2]);
      Apply(t.columns[3],
            [&] { Model::Check(Model::kUsedPorts, std::get<int64_t>(values[3]), ports); });
    } else if (std::string(t.name) == "meta") {
      meta_[std::get<std::string>(values[0])] = std::get<std::string>(values[1]);
    }
  }

  // Counters left out: seq values go after the largest given one (and
  // after a given next_seq), fault ids after the largest given id; then the
  // ordering counter goes beyond every seq.
  void AssignCounters() {
    const auto next = NextSeqGiven();
    int64_t given = 0;
    for (const Table& t : Dump::Tables()) {
      if (IsSeq(t)) given = std::max(given, Store::Rows::Max(db_, t.Shape(), "seq"));
    }
    if (next && *next <= given) {
      Bad("meta key \"next_seq\" (" + std::to_string(*next) + ") is not beyond the largest seq (" +
          std::to_string(given) + ")");
    }
    const int64_t base = next ? *next - 1 : given;
    int64_t maxSeq = 0;
    for (const Table& t : Dump::Tables()) {
      if (t.counter == nullptr) continue;
      Store::Rows::AssignPlaceholders(
          db_, t.Shape(), t.counter,
          IsSeq(t) ? base : std::max<int64_t>(0, Store::Rows::Max(db_, t.Shape(), t.counter)));
      if (IsSeq(t)) maxSeq = std::max(maxSeq, Store::Rows::Max(db_, t.Shape(), "seq"));
    }
    if (!Model::Within(Model::kSeq, maxSeq + 1)) {
      Bad("the largest seq (" + std::to_string(maxSeq) + ") leaves no room for the counter");
    }
    const int64_t counter = next ? std::max(*next, maxSeq + 1) : maxSeq + 1;
    Store::Rows::Replace(db_, Dump::TableNamed("meta").Shape(),
                         {std::string(Dump::kNextSeqKey), std::to_string(counter)});
  }

  static bool IsSeq(const Table& t) {
    return t.counter != nullptr && std::string(t.counter) == "seq";
  }

  // The next_seq the document gives, checked; nothing when it gives none.
  std::optional<int64_t> NextSeqGiven() {
    const auto next = meta_.find(Dump::kNextSeqKey);
    if (next == meta_.end()) return std::nullopt;
    const std::string& text = next->second;
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
    const auto ens = meta_.find(Dump::kEnsNodeKey);
    if (ens == meta_.end()) {
      Store::Rows::Insert(db_, Dump::TableNamed("meta").Shape(),
                          {std::string(Dump::kEnsNodeKey), std::string("0")});
    } else if (ens->second != "0" && ens->second != "1") {
      Bad("meta key \"ens_node\" must be \"0\" or \"1\", not " + Quote(ens->second));
    }
  }

  Store::Db& db_;
  const Progress& progress_;
  int level_ = 0;  // 1: top object, 2: tables, 3: a table's rows
  std::string topKey_;
  std::set<std::string> topKeys_;
  std::set<std::string> seenTables_;
  const Table* table_ = nullptr;
  int64_t rowNumber_ = 0;
  int64_t rows_ = 0;
  int64_t placeholders_ = 0;
  std::map<std::string, std::string> meta_;
  RowBuilder row_;
};

}  // namespace

void Host::Load(const std::string& text, const Progress& progress) {
  Store::Db& db = state_->db();
  Instrument::Scope scope(db, "Load");
  Store::Transaction transaction(db);
  for (const auto& table : Dump::Tables()) Store::Rows::Clear(db, table.Shape());
  Loader loader(db, progress);
  Json::sax_parse(text, &loader);
  loader.Finish();
  transaction.Commit();
}

}  // namespace TarnCtl::Admin
