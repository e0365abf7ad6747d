// The whole host as a JSON document, and back.
//
// Format (version 1):
//   {
//     "format": "tarnhost-dump",
//     "version": 1,
//     "tables": { "<table>": [ {<column>: <value>, ...}, ... ], ... }
//   }
// Every table of the host appears, in the fixed order of kTables, its rows
// in the order of kTables' ORDER BY, each row's fields in column order.
// Teaming policies appear as objects, opaque uplinks as arrays. A text that
// is not valid UTF-8 (names are bytes) appears as {"hex": "<bytes in hex>"}.
//
// Neither direction holds the host twice: Dump writes rows straight into
// the text it returns, Load parses the text as a stream of events and
// inserts each row as soon as it is complete. Load replaces the host in
// one transaction; any fault in the document rolls it back. "version"
// must come before "tables" so that rows are read knowing their format.
#include <cstdio>
#include <cstdlib>
#include <limits>
#include <set>
#include <string>
#include <type_traits>
#include <vector>

#include <nlohmann/json.hpp>

#include "hostctl/exception.h"
#include "hostctl/records.h"
#include "tarnctl/admin.h"
#include "tarnctl/admin_state.h"
#include "tarnctl/policy_codec.h"

namespace TarnCtl::Admin {
namespace {

using Detail::Session;
using Detail::Statement;
using HostCtl::Lib::HostCtlException;
using HostCtl::Network::NicTeamingPolicy;
using nlohmann::json;

constexpr const char* kFormat = "tarnhost-dump";
constexpr int64_t kVersion = 1;
constexpr int64_t kMax32 = std::numeric_limits<uint32_t>::max();
constexpr int64_t kMax64 = std::numeric_limits<int64_t>::max();

enum class Kind {
  Int,      // integer within [min, max]
  Text,     // text of min..max bytes
  OptText,  // like Text, or null
  Policy,   // teaming policy (PolicyCodec text in the database)
  Names,    // list of names (JSON array text in the database)
};

struct Column {
  const char* name;
  Kind kind;
  int64_t min = 0;
  int64_t max = kMax64;
};

struct Table {
  const char* name;
  std::vector<Column> columns;
  const char* order;
};

Column Int(const char* name, int64_t min = 0, int64_t max = kMax64) {
  return {name, Kind::Int, min, max};
}
Column Text(const char* name, int64_t min = 0, int64_t max = kMax64) {
  return {name, Kind::Text, min, max};
}
Column Layer() {
  return Int("layer", 0, 1);
}
Column Seq() {
  return Int("seq", 1);
}
Column Flag(const char* name) {
  return Int(name, 0, 1);
}
Column SwitchName(const char* name) {
  return Text(name, 1, 31);
}

const std::vector<Table>& Tables() {
  static const std::vector<Table> tables = {
      {"meta", {Text("key", 1), Text("value")}, "key"},
      {"pnic", {Seq(), SwitchName("name")}, "seq"},
      {"vswitch",
       {Layer(),
        SwitchName("name"),
        Seq(),
        Int("num_ports", 8, 4096),
        Int("mtu", 1280, 9000),
        Int("cdp", 0, 3),
        Flag("system"),
        {"policy", Kind::Policy}},
       "layer, seq, name"},
      {"portgroup",
       {Layer(),
        Text("name", 1, 127),
        SwitchName("switch"),
        Seq(),
        Int("vlan", 0, 4095),
        {"policy", Kind::Policy}},
       "layer, seq, name"},
      {"link", {Layer(), SwitchName("pnic"), SwitchName("switch"), Seq()}, "layer, seq, pnic"},
      {"client", {Text("portgroup", 1, 127), Text("name", 1), Seq()}, "seq, portgroup, name"},
      {"dvswitch",
       {Layer(), SwitchName("name"), SwitchName("portset"), Text("switch_id", 1), Text("uuid"),
        Text("impl_class"), Int("version", 0, std::numeric_limits<int32_t>::max()),
        Int("num_ports", 8, 4096), Int("mtu", 1280, 9000), Seq()},
       "layer, seq, name"},
      {"dvs_uplink",
       {Layer(), SwitchName("pnic"), SwitchName("dvs"), {"port_id", Kind::OptText}, Seq()},
       "layer, seq, pnic"},
      {"dvport",
       {SwitchName("dvs"), Text("port_id", 1), Int("connection_id", 0, kMax32), Seq()},
       "seq, dvs, port_id"},
      {"dvport_client",
       {SwitchName("dvs"), Text("port_id", 1), Text("name", 1), Seq()},
       "seq, dvs, port_id, name"},
      {"dvport_event", {Seq(), Text("dvs"), Text("port_id"), Text("kind")}, "seq"},
      {"opaque",
       {SwitchName("name"),
        SwitchName("portset"),
        Int("num_ports", 0, 4096),
        Int("used_ports", 0, 4096),
        {"uplinks", Kind::Names},
        Seq()},
       "seq, name"},
      {"ens", {SwitchName("portset"), Flag("intr"), Flag("fast_switch")}, "portset"},
      {"ens_event", {Seq(), Text("portset"), Flag("mode"), Flag("force")}, "seq"},
      {"uplink_timeout",
       {Layer(), Text("portset"), Text("uplink"), Int("lag_id", 0, kMax32), Int("timeout", 0, 255)},
       "layer, portset, uplink, lag_id"},
      {"lag_timeout",
       {Layer(), Text("portset"), Int("lag_id", 0, kMax32), Int("timeout", 0, 255)},
       "layer, portset, lag_id"},
      {"fault",
       {Int("id", 1),
        Text("operation", 1),
        {"target", Kind::OptText},
        Text("message"),
        Text("detail"),
        Int("skip"),
        Int("times")},
       "id"},
  };
  return tables;
}

std::string ColumnList(const Table& t) {
  std::string list;
  for (const auto& c : t.columns) list += (list.empty() ? "" : ", ") + std::string(c.name);
  return list;
}

// ---- writing ----------------------------------------------------------

bool IsUtf8(const std::string& s) {
  const auto* p = reinterpret_cast<const unsigned char*>(s.data());
  const auto* end = p + s.size();
  while (p < end) {
    unsigned c = *p++;
    if (c < 0x80) continue;
    int more;
    unsigned cp;
    if (c >= 0xc2 && c <= 0xdf) {
      more = 1, cp = c & 0x1f;
    } else if (c >= 0xe0 && c <= 0xef) {
      more = 2, cp = c & 0x0f;
    } else if (c >= 0xf0 && c <= 0xf4) {
      more = 3, cp = c & 0x07;
    } else {
      return false;
    }
    if (end - p < more) return false;
    for (int i = 0; i < more; ++i) {
      if ((p[i] & 0xc0) != 0x80) return false;
      cp = (cp << 6) | (p[i] & 0x3f);
    }
    p += more;
    if ((more == 2 && cp < 0x800) || (more == 3 && cp < 0x10000) || cp > 0x10ffff ||
        (cp >= 0xd800 && cp <= 0xdfff)) {
      return false;
    }
  }
  return true;
}

class Writer {
 public:
  std::string out;

  void Indent(int depth) { out.append(2 * depth, ' '); }
  void Key(int depth, const char* key) {
    out += '\n';
    Indent(depth);
    out += '"';
    out += key;
    out += "\": ";
  }
  void Quoted(const std::string& s) {
    static const char* hex = "0123456789abcdef";
    out += '"';
    for (unsigned char c : s) {
      switch (c) {
        case '"':
          out += "\\\"";
          break;
        case '\\':
          out += "\\\\";
          break;
        case '\b':
          out += "\\b";
          break;
        case '\f':
          out += "\\f";
          break;
        case '\n':
          out += "\\n";
          break;
        case '\r':
          out += "\\r";
          break;
        case '\t':
          out += "\\t";
          break;
        default:
          if (c < 0x20) {
            out += "\\u00";
            out += hex[c >> 4];
            out += hex[c & 15];
          } else {
            out += static_cast<char>(c);
          }
      }
    }
    out += '"';
  }
  // A name or text at `depth` (the depth of the key that holds it).
  void Text(int depth, const std::string& s) {
    if (IsUtf8(s)) return Quoted(s);
    static const char* hex = "0123456789abcdef";
    std::string h;
    for (unsigned char c : s) h += {hex[c >> 4], hex[c & 15]};
    out += '{';
    Key(depth + 1, "hex");
    Quoted(h);
    out += '\n';
    Indent(depth);
    out += '}';
  }
  void Names(int depth, const std::vector<std::string>& names) {
    if (names.empty()) {
      out += "[]";
      return;
    }
    out += '[';
    for (size_t i = 0; i < names.size(); ++i) {
      out += i ? ",\n" : "\n";
      Indent(depth + 1);
      Text(depth + 1, names[i]);
    }
    out += '\n';
    Indent(depth);
    out += ']';
  }
  void Policy(int depth, const NicTeamingPolicy& p) {
    out += '{';
    Key(depth + 1, "flags");
    out += std::to_string(p.flags) + ',';
    Key(depth + 1, "balancing");
    out += std::to_string(p.balancing) + ',';
    Key(depth + 1, "failback");
    out += std::to_string(p.failback) + ',';
    Key(depth + 1, "linkCriteria");
    out += '{';
    Key(depth + 2, "checkMask");
    out += std::to_string(p.linkCriteria.checkMask) + ',';
    Key(depth + 2, "minSpeed");
    out += std::to_string(p.linkCriteria.minSpeed) + ',';
    Key(depth + 2, "errorPercent");
    out += std::to_string(p.linkCriteria.errorPercent) + ',';
    Key(depth + 2, "fullDuplex");
    out += std::to_string(p.linkCriteria.fullDuplex) + '\n';
    Indent(depth + 1);
    out += "},";
    Key(depth + 1, "uplinkOrder");
    Names(depth + 1, p.uplinkOrder);
    out += ',';
    Key(depth + 1, "maxActive");
    out += std::to_string(p.maxActive) + '\n';
    Indent(depth);
    out += '}';
  }
};

void DumpTable(Session& s, Writer& w, const Table& t) {
  const std::string sql = "SELECT " + ColumnList(t) + " FROM " + t.name + " ORDER BY " + t.order;
  auto stmt = s.Prepare(sql.c_str());
  bool first = true;
  w.out += '[';
  while (stmt.Step()) {
    w.out += first ? "\n" : ",\n";
    first = false;
    w.Indent(3);
    w.out += '{';
    for (size_t i = 0; i < t.columns.size(); ++i) {
      const Column& c = t.columns[i];
      const int col = static_cast<int>(i);
      w.Key(4, c.name);
      switch (c.kind) {
        case Kind::Int:
          w.out += std::to_string(stmt.Int(col));
          break;
        case Kind::Text:
          w.Text(4, stmt.Text(col));
          break;
        case Kind::OptText:
          if (stmt.IsNull(col)) {
            w.out += "null";
          } else {
            w.Text(4, stmt.Text(col));
          }
          break;
        case Kind::Policy:
          w.Policy(4, Detail::DecodeTeamingPolicy(stmt.Text(col)));
          break;
        case Kind::Names:
          w.Names(4, Detail::DecodeNameList(stmt.Text(col)));
          break;
      }
      if (i + 1 < t.columns.size()) w.out += ',';
    }
    w.out += '\n';
    w.Indent(3);
    w.out += '}';
  }
  if (!first) {
    w.out += '\n';
    w.Indent(2);
  }
  w.out += ']';
}

}  // namespace

std::string Host::Dump() {
  Session& s = *state_->session;
  Writer w;
  w.out += "{";
  w.Key(1, "format");
  w.Quoted(kFormat);
  w.out += ',';
  w.Key(1, "version");
  w.out += std::to_string(kVersion) + ',';
  w.Key(1, "tables");
  w.out += '{';
  const auto& tables = Tables();
  for (size_t i = 0; i < tables.size(); ++i) {
    w.Key(2, tables[i].name);
    DumpTable(s, w, tables[i]);
    if (i + 1 < tables.size()) w.out += ',';
  }
  w.out += "\n  }\n}\n";
  return std::move(w.out);
}

// ---- reading ----------------------------------------------------------

namespace {

[[noreturn]] void Bad(const std::string& why) {
  const std::string message = "Cannot load dump: " + why;
  throw HostCtlException(message, "Load: " + message);
}

std::string Quote(const std::string& s) {
  return "\"" + s + "\"";
}

// Builds one row's value from parse events (rows are small).
class RowBuilder {
 public:
  bool active() const { return !stack_.empty(); }
  json& row() { return row_; }

  void Begin() {
    row_ = json::object();
    stack_.assign(1, &row_);
  }
  void Key(std::string key) { key_ = std::move(key); }
  void Value(json v) { Place(std::move(v)); }
  void Open(json container) { stack_.push_back(Place(std::move(container))); }
  // True when the row itself was closed.
  bool Close() {
    stack_.pop_back();
    return stack_.empty();
  }

 private:
  json* Place(json v) {
    json& top = *stack_.back();
    if (top.is_array()) {
      top.push_back(std::move(v));
      return &top.back();
    }
    if (top.contains(key_)) Bad("field " + Quote(key_) + " appears twice");
    return &(top[key_] = std::move(v));
  }

  json row_;
  std::vector<json*> stack_;
  std::string key_;
};

std::string FromHex(const std::string& hex) {
  auto digit = [](char c) -> int {
    if (c >= '0' && c <= '9') return c - '0';
    if (c >= 'a' && c <= 'f') return c - 'a' + 10;
    return -1;
  };
  std::string out;
  if (hex.size() % 2) return {};
  for (size_t i = 0; i < hex.size(); i += 2) {
    int hi = digit(hex[i]), lo = digit(hex[i + 1]);
    if (hi < 0 || lo < 0) return {};
    out += static_cast<char>(hi * 16 + lo);
  }
  return out;
}

class Loader : public nlohmann::json_sax<json> {
 public:
  explicit Loader(Session& s) : s_(s) {}

  bool null() override { return Scalar(nullptr); }
  bool boolean(bool v) override { return Scalar(v); }
  bool number_integer(number_integer_t v) override { return Scalar(v); }
  bool number_unsigned(number_unsigned_t v) override { return Scalar(v); }
  bool number_float(number_float_t v, const string_t&) override { return Scalar(v); }
  bool string(string_t& v) override { return Scalar(v); }
  bool binary(binary_t&) override { Bad("binary values are not allowed"); }

  bool start_object(std::size_t) override {
    if (row_.active()) {
      row_.Open(json::object());
    } else if (level_ == 0) {
      level_ = 1;
    } else if (level_ == 1 && topKey_ == "tables") {
      if (!version_) Bad("\"version\" must come before \"tables\"");
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
      row_.Open(json::array());
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
      BeginTable(k);
    }
    return true;
  }

  bool end_object() override {
    if (row_.active()) {
      if (row_.Close()) InsertRow(row_.row());
    } else if (level_ == 2) {
      for (const auto& t : Tables()) {
        if (!seenTables_.count(t.name)) Bad("table " + Quote(t.name) + " is missing");
      }
      level_ = 1;
    } else {
      if (!format_) Bad("key \"format\" is missing");
      if (!version_) Bad("key \"version\" is missing");
      if (!topKeys_.count("tables")) Bad("key \"tables\" is missing");
      level_ = 0;
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

 private:
  bool Scalar(json v) {
    if (row_.active()) {
      row_.Value(std::move(v));
      return true;
    }
    if (level_ == 1 && topKey_ == "format") {
      if (!v.is_string() || v.get<std::string>() != kFormat) {
        Bad("\"format\" must be " + Quote(kFormat));
      }
      format_ = true;
      return true;
    }
    if (level_ == 1 && topKey_ == "version") {
      if (!v.is_number_integer()) Bad("\"version\" must be an integer");
      if (!v.is_number_unsigned() || v.get<uint64_t>() != static_cast<uint64_t>(kVersion)) {
        Bad("unsupported version " + v.dump() + " (this host reads version " +
            std::to_string(kVersion) + ")");
      }
      version_ = true;
      return true;
    }
    Misplaced(v.is_null() ? "null" : "a " + std::string(v.type_name()));
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

  void BeginTable(const std::string& name) {
    table_ = nullptr;
    for (const auto& t : Tables()) {
      if (name == t.name) table_ = &t;
    }
    if (!table_) Bad("unknown table " + Quote(name));
    if (!seenTables_.insert(name).second) Bad("table " + Quote(name) + " appears twice");
    std::string marks;
    for (size_t i = 1; i <= table_->columns.size(); ++i) {
      marks += (i > 1 ? ", ?" : "?") + std::to_string(i);
    }
    insertSql_ = "INSERT OR IGNORE INTO " + std::string(table_->name) + "(" + ColumnList(*table_) +
                 ") VALUES(" + marks + ") RETURNING 1";
  }

  [[noreturn]] void BadField(const Column& c, const std::string& why) {
    Bad("table " + Quote(table_->name) + ", row " + std::to_string(rowNumber_) + ": field " +
        Quote(c.name) + " " + why);
  }

  std::string TextValue(const Column& c, const json& v) {
    std::string text;
    if (v.is_string()) {
      text = v.get<std::string>();
    } else if (v.is_object() && v.size() == 1 && v.contains("hex") && v["hex"].is_string()) {
      const auto& hex = v["hex"].get_ref<const std::string&>();
      text = FromHex(hex);
      if (text.empty() && !hex.empty()) BadField(c, "has a malformed \"hex\" text");
    } else {
      BadField(c, "must be a string");
    }
    if (static_cast<int64_t>(text.size()) < c.min || static_cast<int64_t>(text.size()) > c.max) {
      BadField(c, text.empty() ? "must not be empty" : "is too long");
    }
    return text;
  }

  // An integer of the row or of a policy, within [min, max].
  template <typename T>
  T Number(const Column& c, const json& v, const char* what, T min, T max) {
    const std::string label = what ? std::string(" (") + what + ")" : "";
    if (!v.is_number_integer()) BadField(c, "must be an integer" + label);
    bool ok = false;
    if (v.is_number_unsigned()) {  // the parser reports every value >= 0 as unsigned
      const auto u = v.get<uint64_t>();
      if constexpr (std::is_signed_v<T>) {
        ok = max >= 0 && u <= static_cast<uint64_t>(max) &&
             (min <= 0 || u >= static_cast<uint64_t>(min));
      } else {
        ok = u >= min && u <= max;
      }
    } else if constexpr (std::is_signed_v<T>) {
      const auto i = v.get<int64_t>();
      ok = i >= min && i <= max;
    }
    if (!ok) {
      BadField(c, "must be " + std::to_string(min) + " to " + std::to_string(max) + label);
    }
    return v.get<T>();
  }

  NicTeamingPolicy PolicyValue(const Column& c, const json& v) {
    static const std::set<std::string> keys = {"flags",        "balancing",   "failback",
                                               "linkCriteria", "uplinkOrder", "maxActive"};
    static const std::set<std::string> criteriaKeys = {"checkMask", "minSpeed", "errorPercent",
                                                       "fullDuplex"};
    auto checkKeys = [&](const json& o, const std::set<std::string>& want, const char* what) {
      if (!o.is_object()) BadField(c, std::string("must hold ") + what + " as an object");
      for (const auto& k : want) {
        if (!o.contains(k)) BadField(c, "lacks " + Quote(k));
      }
      for (const auto& item : o.items()) {
        if (!want.count(item.key())) BadField(c, "has unknown key " + Quote(item.key()));
      }
    };
    checkKeys(v, keys, "the policy");
    const json& lc = v["linkCriteria"];
    checkKeys(lc, criteriaKeys, "linkCriteria");
    NicTeamingPolicy p;
    p.flags = Number<uint64_t>(c, v["flags"], "flags", 0, UINT64_MAX);
    p.balancing = Number<uint16_t>(c, v["balancing"], "balancing", 0, UINT16_MAX);
    p.failback = Number<uint8_t>(c, v["failback"], "failback", 0, UINT8_MAX);
    p.linkCriteria.checkMask = Number<uint64_t>(c, lc["checkMask"], "checkMask", 0, UINT64_MAX);
    p.linkCriteria.minSpeed = Number<uint64_t>(c, lc["minSpeed"], "minSpeed", 0, UINT64_MAX);
    p.linkCriteria.errorPercent =
        Number<uint32_t>(c, lc["errorPercent"], "errorPercent", 0, UINT32_MAX);
    p.linkCriteria.fullDuplex = Number<uint8_t>(c, lc["fullDuplex"], "fullDuplex", 0, UINT8_MAX);
    p.maxActive = Number<int32_t>(c, v["maxActive"], "maxActive", INT32_MIN, INT32_MAX);
    p.uplinkOrder = NamesValue(c, v["uplinkOrder"]);
    return p;
  }

  std::vector<std::string> NamesValue(const Column& c, const json& v) {
    if (!v.is_array()) BadField(c, "must be an array of names");
    std::vector<std::string> names;
    const Column element{c.name, Kind::Text, 0, kMax64};
    for (const auto& item : v) names.push_back(TextValue(element, item));
    return names;
  }

  void InsertRow(const json& row) {
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
    auto insert = s_.Prepare(insertSql_.c_str());
    for (size_t i = 0; i < t.columns.size(); ++i) {
      const Column& c = t.columns[i];
      const int index = static_cast<int>(i) + 1;
      if (!row.contains(c.name)) BadField(c, "is missing");
      const json& v = row[c.name];
      switch (c.kind) {
        case Kind::Int:
          insert.Bind(index, Number<int64_t>(c, v, nullptr, c.min, c.max));
          break;
        case Kind::Text:
          insert.Bind(index, TextValue(c, v));
          break;
        case Kind::OptText:
          if (v.is_null()) {
            insert.BindNull(index);
          } else {
            insert.Bind(index, TextValue(c, v));
          }
          break;
        case Kind::Policy:
          insert.Bind(index, Detail::EncodeTeamingPolicy(PolicyValue(c, v)));
          break;
        case Kind::Names:
          insert.Bind(index, Detail::EncodeNameList(NamesValue(c, v)));
          break;
      }
    }
    bool inserted = false;
    while (insert.Step()) inserted = true;
    if (!inserted) {
      Bad("table " + Quote(t.name) + ", row " + std::to_string(rowNumber_) +
          ": repeats the key of an earlier row");
    }
  }

  Session& s_;
  int level_ = 0;  // 1: top object, 2: tables, 3: a table's rows
  std::string topKey_;
  std::set<std::string> topKeys_;
  bool format_ = false;
  bool version_ = false;
  std::set<std::string> seenTables_;
  const Table* table_ = nullptr;
  std::string insertSql_;
  int64_t rowNumber_ = 0;
  RowBuilder row_;
};

// Consistency of the loaded rows: each query yields the first offender.
// Only what the library itself keeps true is checked: clients of a port
// group that exists in no layer (they wait for it), DVPorts of a switch
// that was dropped from the cache, and names or pnics that the stored
// layers share with the running state are all states it can leave.
struct Check {
  const char* sql;
  const char* what;  // completed by the offender's columns
};

const Check kChecks[] = {
    {"SELECT name, switch FROM portgroup p WHERE NOT EXISTS"
     " (SELECT 1 FROM vswitch v WHERE v.layer = p.layer AND v.name = p.switch) LIMIT 1",
     "port group %s belongs to switch %s, which does not exist in its layer"},
    {"SELECT pnic, switch FROM link l WHERE NOT EXISTS"
     " (SELECT 1 FROM vswitch v WHERE v.layer = l.layer AND v.name = l.switch) LIMIT 1",
     "pnic %s is linked to switch %s, which does not exist in its layer"},
    {"SELECT pnic, switch FROM link l WHERE NOT EXISTS (SELECT 1 FROM pnic WHERE name = l.pnic)"
     " LIMIT 1",
     "pnic %s, linked to %s, does not exist"},
    {"SELECT pnic, dvs FROM dvs_uplink u WHERE NOT EXISTS"
     " (SELECT 1 FROM dvswitch d WHERE d.layer = u.layer AND d.name = u.dvs) LIMIT 1",
     "uplink %s belongs to distributed switch %s, which does not exist in its layer"},
    {"SELECT pnic, dvs FROM dvs_uplink u WHERE NOT EXISTS"
     " (SELECT 1 FROM pnic WHERE name = u.pnic) LIMIT 1",
     "uplink %s of %s is not a pnic"},
    {"SELECT pnic, port_id FROM dvs_uplink u WHERE port_id IS NOT NULL AND NOT EXISTS"
     " (SELECT 1 FROM dvport p WHERE p.dvs = u.dvs AND p.port_id = u.port_id) LIMIT 1",
     "uplink %s is on DVPort %s, which does not exist"},
    {"SELECT name, port_id FROM dvport_client c WHERE NOT EXISTS"
     " (SELECT 1 FROM dvport p WHERE p.dvs = c.dvs AND p.port_id = c.port_id) LIMIT 1",
     "client %s is on DVPort %s, which does not exist"},
    {"SELECT pnic, 'running' FROM (SELECT pnic FROM link WHERE layer = 1 UNION ALL"
     " SELECT pnic FROM dvs_uplink WHERE layer = 1) GROUP BY pnic HAVING count(*) > 1 LIMIT 1",
     "pnic %s is linked twice in the %s state"},
    {"SELECT n, 'running' FROM (SELECT name AS n FROM vswitch WHERE layer = 1"
     " UNION ALL SELECT name FROM dvswitch WHERE layer = 1"
     " UNION ALL SELECT portset FROM dvswitch WHERE layer = 1 AND portset <> name"
     " UNION ALL SELECT name FROM opaque"
     " UNION ALL SELECT portset FROM opaque WHERE portset <> name)"
     " GROUP BY n HAVING count(*) > 1 LIMIT 1",
     "switch or portset name %s is used twice in the %s state"},
};

void CheckConsistency(Session& s) {
  for (const auto& check : kChecks) {
    auto stmt = s.Prepare(check.sql);
    if (!stmt.Step()) continue;
    const std::string a = stmt.Text(0), b = stmt.Text(1);
    std::string why = check.what;
    why.replace(why.find("%s"), 2, a);
    why.replace(why.find("%s"), 2, b);
    Bad(why);
  }
  // Opaque uplinks are lists inside a column.
  auto opaque = s.Prepare("SELECT name, uplinks FROM opaque");
  while (opaque.Step()) {
    for (const auto& uplink : Detail::DecodeNameList(opaque.Text(1))) {
      if (!s.Prepare("SELECT 1 FROM pnic WHERE name = ?1").Bind(1, uplink).Step()) {
        Bad("uplink " + uplink + " of opaque switch " + opaque.Text(0) + " is not a pnic");
      }
    }
  }
  auto ens = s.Prepare("SELECT value FROM meta WHERE key = 'ens_node' AND value NOT IN ('0', '1')");
  if (ens.Step()) Bad("meta key \"ens_node\" must be \"0\" or \"1\", not " + Quote(ens.Text(0)));
  // The ordering counter must lie beyond every seq already drawn.
  auto meta = s.Prepare("SELECT value FROM meta WHERE key = 'next_seq'");
  if (!meta.Step()) Bad("meta key \"next_seq\" is missing");
  const std::string text = meta.Text(0);
  char* end = nullptr;
  const long long next = std::strtoll(text.c_str(), &end, 10);
  if (text.empty() || *end) Bad("meta key \"next_seq\" is not a number: " + text);
  std::string maxSql = "SELECT max(m) FROM (";
  bool first = true;
  for (const auto& t : Tables()) {
    for (const auto& c : t.columns) {
      if (std::string(c.name) != "seq") continue;
      maxSql += std::string(first ? "" : " UNION ALL ") + "SELECT max(seq) AS m FROM " + t.name;
      first = false;
    }
  }
  maxSql += ")";
  auto max = s.Prepare(maxSql.c_str());
  if (max.Step() && !max.IsNull(0) && max.Int(0) >= next) {
    Bad("meta key \"next_seq\" (" + text + ") is not beyond the largest seq (" +
        std::to_string(max.Int(0)) + ")");
  }
}

}  // namespace

void Host::Load(const std::string& text) {
  Session& s = *state_->session;
  Detail::Transaction tx(s);
  for (const auto& t : Tables()) s.Exec(("DELETE FROM " + std::string(t.name)).c_str());
  Loader loader(s);
  json::sax_parse(text, &loader);
  CheckConsistency(s);
  tx.Commit();
}

}  // namespace TarnCtl::Admin
