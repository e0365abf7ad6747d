// Each kind of object is compared from its home's reading: objects are
// matched by name, and only a pair whose readings differ is turned into
// JSON, so that a large host that changed little costs one reading of each
// side.
#include "tarnctl/admin/diff.h"

#include <algorithm>
#include <functional>
#include <unordered_map>
#include <unordered_set>

#include "tarnctl/admin/distributed.h"
#include "tarnctl/admin/dvport.h"
#include "tarnctl/admin/ens.h"
#include "tarnctl/admin/faults.h"
#include "tarnctl/admin/opaque.h"
#include "tarnctl/admin/pnic.h"
#include "tarnctl/admin/standard.h"
#include "tarnctl/admin/timeouts.h"
#include "tarnctl/instrument/call.h"

namespace TarnCtl::Admin {

namespace {

using Store::Db;
using Store::Layer;

// The differences of one kind of object, as they are found.
class Collector {
 public:
  Collector(std::vector<Difference>& out, const char* kind, std::optional<Layer> layer)
      : out_(out), kind_(kind), layer_(layer) {}

  void Came(const std::string& name, const std::string& owner, Json object) {
    out_.push_back({kind_, name, owner, layer_, "", nullptr, std::move(object)});
  }
  void Went(const std::string& name, const std::string& owner, Json object) {
    out_.push_back({kind_, name, owner, layer_, "", std::move(object), nullptr});
  }
  // Every key whose value differs, nested objects key by key.
  void Changed(const std::string& name, const Json& from, const Json& to,
               const std::string& prefix = "") {
    for (const auto& [key, value] : from.items()) {
      if (prefix.empty() && key == "name") continue;
      const Json& other = to.contains(key) ? to[key] : Json();
      Field(name, prefix + key, value, other);
    }
    for (const auto& [key, value] : to.items()) {
      if (!from.contains(key)) Field(name, prefix + key, Json(), value);
    }
  }

 private:
  void Field(const std::string& name, const std::string& field, const Json& from, const Json& to) {
    if (from == to) return;
    if (from.is_object() && to.is_object() && !from.contains("hex") && !to.contains("hex")) {
      Changed(name, from, to, field + ".");
      return;
    }
    out_.push_back({kind_, name, "", layer_, field, from, to});
  }

  std::vector<Difference>& out_;
  const char* kind_;
  std::optional<Layer> layer_;
};

// Compares the objects `from` and `to` of one kind, matched by name.
// `name`, `owner` and `json` read an object; `same` tells two readings
// that cannot differ in JSON.
template <typename T, typename Name, typename Owner, typename Same, typename ToJson>
void Compare(Collector& collect, const std::vector<T>& from, const std::vector<T>& to, Name name,
             Owner owner, Same same, ToJson json) {
  std::unordered_map<std::string, const T*> later;
  later.reserve(to.size());
  for (const T& object : to) later.emplace(name(object), &object);
  std::unordered_set<std::string> earlier;
  earlier.reserve(from.size());
  for (const T& object : from) {
    const std::string key = name(object);
    earlier.insert(key);
    const auto found = later.find(key);
    if (found == later.end()) {
      collect.Went(key, owner(object), json(object));
    } else if (!same(object, *found->second)) {
      collect.Changed(key, json(object), json(*found->second));
    }
  }
  for (const T& object : to) {
    const std::string key = name(object);
    if (!earlier.count(key)) collect.Came(key, owner(object), json(object));
  }
}

auto NoOwner = [](const auto&) { return std::string(); };
auto ByName = [](const auto& object) { return object.name; };

// A switch's own fields: its port groups are objects of their own.
StandardSwitch Own(const StandardSwitch& sw) {
  return {sw.name, sw.row, sw.uplinks, {}};
}

std::vector<const PortGroup*> GroupsOf(const std::vector<StandardSwitch>& switches) {
  std::vector<const PortGroup*> groups;
  for (const auto& sw : switches) {
    for (const auto& group : sw.portGroups) groups.push_back(&group);
  }
  return groups;
}

// Timeout records are named by their key: every field but the timeout.
std::vector<Json> Records(const Timeouts& timeouts, const char* key) {
  Json json = Json::object();
  AddTimeoutsJson(timeouts, json);
  return json[key].get<std::vector<Json>>();
}
std::string RecordName(const Json& record) {
  std::vector<std::string> key;
  for (const auto& [field, value] : record.items()) {
    if (field == "timeout") continue;
    key.push_back(value.is_string() ? value.get<std::string>() : value.dump());
  }
  return Join(key, " ");
}

// The layered kinds, each from the reading of `a` in `layerA` to that of `b`
// in `layerB`; `tag` is the layer the differences are told in.
void DiffLayered(Db& a, Layer layerA, Db& b, Layer layerB, std::optional<Layer> tag,
                 std::vector<Difference>& out) {
  const auto switchesA = StandardSwitches(a, layerA), switchesB = StandardSwitches(b, layerB);
  {
    Collector collect(out, "vswitch", tag);
    Compare(
        collect, switchesA, switchesB, ByName, NoOwner,
        [](const StandardSwitch& x, const StandardSwitch& y) {
          return x.row == y.row && x.uplinks == y.uplinks;
        },
        [](const StandardSwitch& sw) {
          Json json = StandardSwitchJson(Own(sw));
          json.erase("portGroups");
          return json;
        });
  }
  {
    Collector collect(out, "portgroup", tag);
    Compare(
        collect, GroupsOf(switchesA), GroupsOf(switchesB),
        [](const PortGroup* group) { return group->name; },
        [](const PortGroup* group) { return group->row.switchName; },
        [](const PortGroup* x, const PortGroup* y) {
          return x->row == y->row && x->clients == y->clients;
        },
        [](const PortGroup* group) { return PortGroupJson(*group); });
  }
  {
    Collector collect(out, "dvswitch", tag);
    Compare(
        collect, DVSwitches(a, layerA), DVSwitches(b, layerB), ByName, NoOwner,
        [](const DVSwitch& x, const DVSwitch& y) {
          return x.row == y.row && x.uplinks == y.uplinks;
        },
        DVSwitchJson);
  }
  const Timeouts timeoutsA = TimeoutsOf(a, layerA), timeoutsB = TimeoutsOf(b, layerB);
  for (const auto& [kind, key] :
       {std::pair{"uplink-timeout", "uplinkTimeouts"}, std::pair{"lag-timeout", "lagTimeouts"}}) {
    Collector collect(out, kind, tag);
    Compare(collect, Records(timeoutsA, key), Records(timeoutsB, key), RecordName, NoOwner,
            std::equal_to<Json>(), [](const Json& record) { return record; });
  }
}

}  // namespace

std::vector<Difference> DiffHosts(Db& from, Db& to) {
  Instrument::Scope scopeFrom(from, "Diff"), scopeTo(to, "Diff");
  std::vector<Difference> out;
  {
    Collector collect(out, "pnic", std::nullopt);
    Compare(collect, PnicNames(from), PnicNames(to), std::identity(), NoOwner,
            std::equal_to<std::string>(), [](const std::string& name) { return Json(name); });
  }
  for (const Layer layer : {Layer::kRunning, Layer::kStored}) {
    DiffLayered(from, layer, to, layer, layer, out);
  }
  {
    Collector collect(out, "dvport", std::nullopt);
    Compare(
        collect, DVPorts(from), DVPorts(to),
        [](const DVPort& port) { return port.dvs + ":" + port.portId; }, NoOwner,
        std::equal_to<DVPort>(), DVPortJson);
  }
  {
    Collector collect(out, "opaque", std::nullopt);
    Compare(
        collect, OpaqueSwitches(from), OpaqueSwitches(to), ByName, NoOwner,
        [](const OpaqueSwitch& x, const OpaqueSwitch& y) { return x.row == y.row; },
        OpaqueSwitchJson);
  }
  {
    Collector collect(out, "ens", std::nullopt);
    const Json a = EnsJson(EnsOf(from)), b = EnsJson(EnsOf(to));
    if (a != b) collect.Changed("", a, b);
  }
  {
    // Events are history: what follows the events both have in common.
    Collector collect(out, "event", std::nullopt);
    const auto a = Events(from), b = Events(to);
    size_t common = 0;
    while (common < a.size() && common < b.size() && a[common] == b[common]) ++common;
    for (size_t i = common; i < a.size(); ++i) collect.Went(a[i], "", a[i]);
    for (size_t i = common; i < b.size(); ++i) collect.Came(b[i], "", b[i]);
  }
  {
    Collector collect(out, "fault", std::nullopt);
    Compare(
        collect, Faults(from), Faults(to),
        [](const Fault& fault) { return std::to_string(fault.id) + " " + fault.operation; },
        NoOwner, std::equal_to<Fault>(), FaultJson);
  }
  return out;
}

std::vector<Difference> DiffLayers(Db& db) {
  Instrument::Scope scope(db, "Diff");
  std::vector<Difference> out;
  DiffLayered(db, Layer::kRunning, db, Layer::kStored, std::nullopt, out);
  return out;
}

namespace {

// A value as a line shows it: a text as it is, a list joined by commas
// ("(none)" when empty), an object in a list as its values joined by ':'.
std::string Shown(const Json& value) {
  if (value.is_string()) return value.get<std::string>();
  if (value.is_array()) {
    if (value.empty()) return "(none)";
    std::vector<std::string> items;
    for (const Json& item : value) items.push_back(Shown(item));
    return Join(items, ",");
  }
  if (value.is_object() && !value.contains("hex")) {
    std::vector<std::string> values;
    for (const auto& [key, item] : value.items()) {
      if (!item.is_null()) values.push_back(Shown(item));
    }
    return Join(values, ":");
  }
  return value.dump(-1, ' ', false, Json::error_handler_t::replace);
}

const char* LayerName(Layer layer) {
  return layer == Layer::kRunning ? "running" : "stored";
}

}  // namespace

std::string DiffText(const std::vector<Difference>& differences) {
  // Each line without its layers, and the layers it was found in, in the
  // order first found.
  std::vector<std::pair<std::string, std::vector<Layer>>> lines;
  std::unordered_map<std::string, size_t> index;
  for (const Difference& d : differences) {
    std::string line;
    const std::string object = d.kind + (d.name.empty() ? "" : " " + d.name);
    if (d.field.empty()) {
      line = (d.from.is_null() ? "+ " : "- ") + object + (d.owner.empty() ? "" : " on " + d.owner);
    } else {
      line = object + "\t" + d.field + " " + Shown(d.from) + " -> " + Shown(d.to);
    }
    const auto [found, fresh] = index.emplace(line, lines.size());
    if (fresh) lines.push_back({line, {}});
    if (d.layer) lines[found->second].second.push_back(*d.layer);
  }
  std::string text;
  for (auto& [line, layers] : lines) {
    std::string tag;
    if (!layers.empty()) {
      std::sort(layers.begin(), layers.end(), std::greater<>());  // running first
      std::vector<const char*> names;
      for (const Layer layer : layers) names.push_back(LayerName(layer));
      tag = " [" + Join(names, ", ") + "]";
    }
    const auto tab = line.find('\t');
    if (tab == std::string::npos) {
      text += line + tag + "\n";
    } else {
      text += line.substr(0, tab) + tag + ": " + line.substr(tab + 1) + "\n";
    }
  }
  return text;
}

Json DiffJson(const std::vector<Difference>& differences) {
  Json array = Json::array();
  for (const Difference& d : differences) {
    array.push_back({{"kind", d.kind},
                     {"name", TextJson(d.name)},
                     {"layer", d.layer ? Json(LayerName(*d.layer)) : Json(nullptr)},
                     {"field", d.field.empty() ? Json(nullptr) : Json(d.field)},
                     {"from", d.from},
                     {"to", d.to}});
  }
  return array;
}

}  // namespace TarnCtl::Admin
