// The whole host as a JSON document:
//   {
//     "format": "tarnhost-dump",
//     "version": 1,
//     "tables": { "<table>": [ {<column>: <value>, ...}, ... ], ... }
//   }
// every table in catalogue order, its rows in the catalogue's order, each
// row's fields in column order, indented by two spaces. Teaming policies
// appear as objects with every field, opaque uplinks as arrays. A text that
// is not valid UTF-8 appears as {"hex": "<bytes in hex>"}.
//
// The host is not held twice: each row is made a JSON value and written
// into the text at once.
#include <string>
#include <unordered_map>

#include "tarnctl/admin/dump/catalogue.h"
#include "tarnctl/admin/text_json.h"
#include "tarnctl/admin/whole_host.h"
#include "tarnctl/instrument/call.h"
#include "tarnctl/store/policy_codec.h"

namespace TarnCtl::Admin {

namespace {

using Dump::Kind;
using Json = Store::Json;

constexpr int kIndent = 2;
// Rows stand at depth 3 of the document.
constexpr int kRowDepth = 3;

// The JSON of each stored policy text met so far: most rows share a few.
class Policies {
 public:
  const Json& Of(const std::string& stored) {
    auto found = known_.find(stored);
    if (found == known_.end()) found = known_.emplace(stored, PolicyJson(stored)).first;
    return found->second;
  }

 private:
  std::unordered_map<std::string, Json> known_;
};

Json ValueJson(const Dump::Column& column, const Store::Rows::Value& value, Policies& policies) {
  switch (column.kind) {
    case Kind::kInt:
      return std::get<int64_t>(value);
    case Kind::kOptText:
      if (std::holds_alternative<std::monostate>(value)) return nullptr;
      [[fallthrough]];
    case Kind::kText:
      return TextJson(std::get<std::string>(value));
    case Kind::kPolicy:
      return policies.Of(std::get<std::string>(value));
    case Kind::kNames:
      return NamesJson(Store::DecodeNameList(std::get<std::string>(value)));
  }
  return nullptr;
}

// Appends `json` as it stands at `depth` of the document: the JSON
// library's own pretty printer, told where it starts.
void Append(std::string& out, const Json& json, int depth) {
  nlohmann::detail::serializer<Json> printer(
      nlohmann::detail::output_adapter<char, std::string>(out), ' ',
      nlohmann::detail::error_handler_t::strict);
  printer.dump(json, true, false, kIndent, kIndent * depth);
}

}  // namespace

std::string DumpHost(Store::Db& db, const Progress& progress) {
  Instrument::Scope scope(db, "Dump");
  int64_t total = 0;
  for (const auto& table : Dump::Tables()) total += Store::Rows::Count(db, table.Shape());
  int64_t done = 0;
  Policies policies;

  std::string out = "{\n  \"format\": ";
  Append(out, Dump::kFormat, 1);
  out += ",\n  \"version\": " + std::to_string(Dump::kVersion) + ",\n  \"tables\": {";
  bool firstTable = true;
  for (const auto& table : Dump::Tables()) {
    out += firstTable ? "\n    " : ",\n    ";
    firstTable = false;
    Append(out, table.name, 2);
    out += ": [";
    bool firstRow = true;
    Json row = Json::object();
    Store::Rows::Scan(db, table.Shape(), [&](const std::vector<Store::Rows::Value>& values) {
      for (size_t i = 0; i < values.size(); ++i) {
        row[table.columns[i].name] = ValueJson(table.columns[i], values[i], policies);
      }
      out += firstRow ? "\n      " : ",\n      ";
      firstRow = false;
      Append(out, row, kRowDepth);
      if (progress && ++done % 4096 == 0) progress(done, total);
    });
    if (!firstRow) out += "\n    ";
    out += "]";
  }
  out += "\n  }\n}\n";
  if (progress) progress(total, total);
  return out;
}

}  // namespace TarnCtl::Admin
