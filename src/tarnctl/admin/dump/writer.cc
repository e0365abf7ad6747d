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
// The host is not held twice: each row is written into the text as it is
// read.
#include <algorithm>
#include <string>
#include <unordered_map>

#include "tarnctl/admin/dump/catalogue.h"
#include "tarnctl/admin/text_json.h"
#include "tarnctl/admin/whole_host.h"
#include "tarnctl/instrument/call.h"
#include "tarnctl/model/names.h"
#include "tarnctl/store/policy_codec.h"

namespace TarnCtl::Admin {

namespace {

using Dump::Kind;
using Json = Store::Json;

constexpr int kIndent = 2;
// Rows stand at depth 3 of the document, their fields at depth 4.
constexpr int kRowDepth = 3;
constexpr int kFieldDepth = kRowDepth + 1;

void Indent(std::string& out, int depth) {
  out.append(static_cast<size_t>(kIndent * depth), ' ');
}

// Appends `json` as it stands at `depth` of the document: the JSON
// library's text of it, each line moved in by the depth. (Its lines break
// only between tokens: a newline in a string is written \n.)
void Append(std::string& out, const Json& json, int depth) {
  const std::string text = json.dump(kIndent);
  size_t from = 0;
  for (size_t end = text.find('\n'); end != std::string::npos; end = text.find('\n', from)) {
    out.append(text, from, end + 1 - from);
    Indent(out, depth);
    from = end + 1;
  }
  out.append(text, from);
}

// Appends a text as TextJson makes it. Most texts are names with nothing
// to escape: those are written as they stand, without a JSON value.
void AppendText(std::string& out, const std::string& text, int depth) {
  const bool plain = std::none_of(text.begin(), text.end(), [](char c) {
    return static_cast<unsigned char>(c) < 0x20 || c == '"' || c == '\\';
  });
  if (plain && Model::IsUtf8(text)) {
    out += '"';
    out += text;
    out += '"';
  } else {
    Append(out, TextJson(text), depth);
  }
}

// The text of each stored policy met so far, as it stands in a row: most
// rows share a few.
class Policies {
 public:
  const std::string& Of(const std::string& stored) {
    auto found = known_.find(stored);
    if (found == known_.end()) {
      std::string text;
      Append(text, PolicyJson(stored), kFieldDepth);
      found = known_.emplace(stored, std::move(text)).first;
    }
    return found->second;
  }

 private:
  std::unordered_map<std::string, std::string> known_;
};

void AppendValue(std::string& out, const Dump::Column& column, const Store::Rows::Value& value,
                 Policies& policies) {
  switch (column.kind) {
    case Kind::kInt:
      out += std::to_string(std::get<int64_t>(value));
      return;
    case Kind::kOptText:
      if (std::holds_alternative<std::monostate>(value)) {
        out += "null";
        return;
      }
      [[fallthrough]];
    case Kind::kText:
      AppendText(out, std::get<std::string>(value), kFieldDepth);
      return;
    case Kind::kPolicy:
      out += policies.Of(std::get<std::string>(value));
      return;
    case Kind::kNames:
      Append(out, NamesJson(Store::DecodeNameList(std::get<std::string>(value))), kFieldDepth);
      return;
  }
}

// A row as the JSON library writes an object of its fields, in column
// order; the names of columns need no escape.
void AppendRow(std::string& out, const Dump::Table& table,
               const std::vector<Store::Rows::Value>& values, Policies& policies) {
  out += '{';
  for (size_t i = 0; i < values.size(); ++i) {
    out += i == 0 ? "\n" : ",\n";
    Indent(out, kFieldDepth);
    out += '"';
    out += table.columns[i].name;
    out += "\": ";
    AppendValue(out, table.columns[i], values[i], policies);
  }
  out += '\n';
  Indent(out, kRowDepth);
  out += '}';
}

}  // namespace

std::string DumpHost(Store::Db& db, const Progress& progress) {
  Instrument::Scope scope(db, "Dump");
  int64_t total = 0;
  for (const auto& table : Dump::Tables()) total += Store::Rows::Count(db, table.Shape());
  int64_t done = 0;
  Policies policies;

  std::string out = "{\n  \"format\": ";
  AppendText(out, Dump::kFormat, 1);
  out += ",\n  \"version\": " + std::to_string(Dump::kVersion) + ",\n  \"tables\": {";
  bool firstTable = true;
  for (const auto& table : Dump::Tables()) {
    out += firstTable ? "\n    " : ",\n    ";
    firstTable = false;
    AppendText(out, table.name, 2);
    out += ": [";
    bool firstRow = true;
    Store::Rows::Scan(db, table.Shape(), [&](const std::vector<Store::Rows::Value>& values) {
      out += firstRow ? "\n      " : ",\n      ";
      firstRow = false;
      AppendRow(out, table, values, policies);
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
