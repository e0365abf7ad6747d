#include "tarnctl/admin/dump/catalogue.h"

#include <cstring>
#include <limits>

#include "tarnctl/instrument/errors.h"
#include "tarnctl/instrument/operations.h"
#include "tarnctl/model/words.h"
#include "tarnctl/store/faults.h"

namespace TarnCtl::Admin::Dump {

namespace {

using Model::NameKind;
using Model::Range;

// Ranges of the dump's own format, beside the library's.
constexpr Range kLayer{"Invalid layer {}", 0, 1};
constexpr Range kFlag{"Invalid flag {}", 0, 1};
constexpr Range kUint32{"Invalid number {}", 0, std::numeric_limits<uint32_t>::max()};
constexpr Range kFaultId{"Invalid fault id {}", 1, Model::kSeq.max};

void CheckMetaKey(const std::string& key) {
  if (key != kNextSeqKey && key != kEnsNodeKey) {
    throw Instrument::Refused("Unknown meta key " + key,
                              "(" + std::string(kNextSeqKey) + " or " + kEnsNodeKey + ")");
  }
}

void CheckEventKind(const std::string& kind) {
  if (kind != "nota") throw Instrument::Refused("Unknown DVPort event " + kind, "(nota)");
}

void CheckUsedPorts(const Fields& row) {
  Model::Check(Model::kUsedPorts, row.Int("used_ports"), row.Int("num_ports"));
}

void CheckOperation(const std::string& name) {
  if (Instrument::FindOperation(name) == nullptr) {
    throw Instrument::Refused("Unknown operation " + name);
  }
}

Column Int(const char* name, const Range& range) {
  return {name, Kind::kInt, &range, std::nullopt, nullptr};
}
Column Name(const char* name, NameKind kind) {
  return {name, Kind::kText, nullptr, kind, nullptr};
}
Column Text(const char* name, TextRule rule = nullptr) {
  return {name, Kind::kText, nullptr, std::nullopt, rule};
}
Column OptName(const char* name, NameKind kind) {
  return {name, Kind::kOptText, nullptr, kind, nullptr};
}
Column Of(const char* name, Kind kind) {
  return {name, kind, nullptr, std::nullopt, nullptr};
}
Column Layer() {
  return Int("layer", kLayer);
}
Column Seq() {
  return Int("seq", Model::kSeq);
}
Column Flag(const char* name) {
  return Int(name, kFlag);
}

// A column that a dump of version 1 made before it existed may lack.
Column Newer(Column column) {
  column.absent = 0;
  return column;
}

// The fault's columns, from its one description (store/faults.h).
std::vector<Column> FaultColumns() {
  using Store::Faults::Value;
  std::vector<Column> columns;
  const Store::Faults::Row none;
  Store::Faults::VisitFields(none, [&](const Store::Faults::Field& field, const auto&) {
    switch (field.value) {
      case Value::kId:
        return columns.push_back(Int(field.column, kFaultId));
      case Value::kOperation:
        return columns.push_back(Text(field.column, CheckOperation));
      case Value::kTarget:
        return columns.push_back(OptName(field.column, NameKind::kFaultTarget));
      case Value::kText:
        return columns.push_back(Text(field.column));
      case Value::kSkip:
        return columns.push_back(Int(field.column, Model::kFaultSkip));
      case Value::kTimes:
        return columns.push_back(Int(field.column, Model::kFaultTimesLeft));
      case Value::kDelay:
        return columns.push_back(Newer(Int(field.column, Model::kFaultDelay)));
      case Value::kFlag:
        return columns.push_back(Newer(Flag(field.column)));
      case Value::kCount:
        return columns.push_back(Newer(Int(field.column, Model::kFaultFired)));
    }
  });
  return columns;
}

}  // namespace

const std::vector<Table>& Tables() {
  static const std::vector<Table> tables = {
      {"meta", "key", {Text("key", CheckMetaKey), Text("value")}},
      {"pnic", "seq", {Seq(), Name("name", NameKind::kPnic)}, "seq"},
      {"vswitch",
       "layer, seq, name",
       {Layer(), Name("name", NameKind::kSwitch), Seq(), Int("num_ports", Model::kPorts),
        Int("mtu", Model::kMtu), Int("cdp", Model::kCdpStatus), Flag("system"),
        Of("policy", Kind::kPolicy)},
       "seq"},
      {"portgroup",
       "layer, seq, name",
       {Layer(), Name("name", NameKind::kPortGroup), Name("switch", NameKind::kSwitch), Seq(),
        Int("vlan", Model::kVlanId), Of("policy", Kind::kPolicy)},
       "seq"},
      {"link",
       "layer, seq, pnic",
       {Layer(), Name("pnic", NameKind::kPnic), Name("switch", NameKind::kSwitch), Seq()},
       "seq"},
      {"client",
       "seq, portgroup, name",
       {Name("portgroup", NameKind::kPortGroup), Name("name", NameKind::kClient), Seq()},
       "seq"},
      {"dvswitch",
       "layer, seq, name",
       {Layer(), Name("name", NameKind::kSwitch), Name("portset", NameKind::kPortset),
        Name("switch_id", NameKind::kSwitchId), Text("uuid", Model::CheckUuid),
        Text("impl_class", Model::CheckImplClass), Int("version", Model::kDvsVersion),
        Int("num_ports", Model::kPorts), Int("mtu", Model::kMtu), Seq()},
       "seq"},
      {"dvs_uplink",
       "layer, seq, pnic",
       {Layer(), Name("pnic", NameKind::kPnic), Name("dvs", NameKind::kSwitch),
        OptName("port_id", NameKind::kDVPort), Seq()},
       "seq"},
      {"dvport",
       "seq, dvs, port_id",
       {Name("dvs", NameKind::kSwitch), Name("port_id", NameKind::kDVPort),
        Int("connection_id", kUint32), Seq()},
       "seq"},
      {"dvport_client",
       "seq, dvs, port_id, name",
       {Name("dvs", NameKind::kSwitch), Name("port_id", NameKind::kDVPort),
        Name("name", NameKind::kClient), Seq()},
       "seq"},
      {"dvport_event",
       "seq",
       {Seq(), Name("dvs", NameKind::kSwitch), Name("port_id", NameKind::kDVPort),
        Text("kind", CheckEventKind)},
       "seq"},
      {"opaque",
       "seq, name",
       {Name("name", NameKind::kSwitch), Name("portset", NameKind::kPortset),
        Int("num_ports", Model::kPorts), Int("used_ports", Model::kUsedPorts),
        Of("uplinks", Kind::kNames), Seq()},
       "seq",
       {{"used_ports", CheckUsedPorts}}},
      {"ens", "portset", {Name("portset", NameKind::kPortset), Flag("intr"), Flag("fast_switch")}},
      {"ens_event",
       "seq",
       {Seq(), Name("portset", NameKind::kPortset), Flag("mode"), Flag("force")},
       "seq"},
      {"uplink_timeout",
       "layer, portset, uplink, lag_id",
       {Layer(), Name("portset", NameKind::kPortset), Name("uplink", NameKind::kUplink),
        Int("lag_id", kUint32), Int("timeout", Model::kTimeout)}},
      {"lag_timeout",
       "layer, portset, lag_id",
       {Layer(), Name("portset", NameKind::kPortset), Int("lag_id", kUint32),
        Int("timeout", Model::kTimeout)}},
      {"fault", "id", FaultColumns(), "id"},
  };
  return tables;
}

Store::Rows::Shape Table::Shape() const {
  Store::Rows::Shape shape{name, {}, order};
  for (const Column& column : columns) shape.columns.push_back(column.name);
  return shape;
}

const Table* FindTable(const std::string& name) {
  for (const Table& table : Tables()) {
    if (name == table.name) return &table;
  }
  return nullptr;
}

bool Table::CountsSeq() const {
  return counter != nullptr && std::strcmp(counter, "seq") == 0;
}

int64_t Fields::Int(const char* column) const {
  size_t i = 0;
  while (i < table_.columns.size() && std::strcmp(table_.columns[i].name, column) != 0) ++i;
  return std::get<int64_t>(values_.at(i));  // a column the table has
}

}  // namespace TarnCtl::Admin::Dump
