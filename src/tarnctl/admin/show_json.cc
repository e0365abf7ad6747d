// The host as JSON, printed from the readings of the objects' homes.
#include "tarnctl/admin/show_json.h"

#include "tarnctl/admin/distributed.h"
#include "tarnctl/admin/dvport.h"
#include "tarnctl/admin/ens.h"
#include "tarnctl/admin/faults.h"
#include "tarnctl/admin/opaque.h"
#include "tarnctl/admin/pnic.h"
#include "tarnctl/admin/standard.h"
#include "tarnctl/admin/timeouts.h"
#include "tarnctl/admin/whole_host.h"
#include "tarnctl/instrument/call.h"
#include "tarnctl/instrument/errors.h"
#include "tarnctl/store/db.h"

namespace TarnCtl::Admin::View {
namespace {

using Store::Db;
using Store::Layer;

constexpr Layer kLayers[] = {Layer::kRunning, Layer::kStored};

const char* LayerKey(Layer layer) {
  return layer == Layer::kRunning ? "running" : "stored";
}

// Each object of `objects` as JSON.
template <typename Objects, typename ToJson>
Json Array(const Objects& objects, ToJson toJson) {
  Json array = Json::array();
  for (const auto& object : objects) array.push_back(toJson(object));
  return array;
}

Json Layered(Db& db, Layer layer) {
  Json json = {{"standardSwitches", Array(StandardSwitches(db, layer), StandardSwitchJson)},
               {"distributedSwitches", Array(DVSwitches(db, layer), DVSwitchJson)}};
  if (layer == Layer::kRunning) json["ens"] = EnsJson(EnsOf(db));
  AddTimeoutsJson(TimeoutsOf(db, layer), json);
  return json;
}

// {"running": ..., "stored": ...} of what `find` finds in each layer (null
// where it finds nothing); nothing when it finds nothing in either.
template <typename Find, typename ToJson>
std::optional<Json> InLayers(Find find, ToJson toJson) {
  Json json = Json::object();
  bool found = false;
  for (const Layer layer : kLayers) {
    const auto object = find(layer);
    found = found || object.has_value();
    json[LayerKey(layer)] = object ? toJson(*object) : Json(nullptr);
  }
  return found ? std::optional<Json>(std::move(json)) : std::nullopt;
}

}  // namespace

Json WholeHost(Db& db) {
  Json json = {{"pnics", PnicNames(db)}};
  for (const Layer layer : kLayers) json[LayerKey(layer)] = Layered(db, layer);
  json["opaqueSwitches"] = Array(OpaqueSwitches(db), OpaqueSwitchJson);
  json["dvports"] = Array(DVPorts(db), DVPortJson);
  json["events"] = Events(db);
  json["faults"] = Array(Faults(db), FaultJson);
  return json;
}

std::optional<Json> Named(Db& db, const std::string& name) {
  Json json = {{"name", name}};
  auto add = [&](const char* kind, std::optional<Json> found) {
    if (found) json[kind] = std::move(*found);
  };
  add("standardSwitch", InLayers([&](Layer layer) { return FindStandardSwitch(db, layer, name); },
                                 StandardSwitchJson));
  add("distributedSwitch",
      InLayers([&](Layer layer) { return FindDVSwitch(db, layer, name); }, DVSwitchJson));
  if (json.contains("distributedSwitch")) {
    json["distributedSwitch"]["dvports"] = Array(DVPortsOn(db, name), DVPortJson);
  }
  add("portGroup",
      InLayers([&](Layer layer) { return FindPortGroup(db, layer, name); }, PortGroupJson));
  if (auto opaque = FindOpaqueSwitch(db, name)) json["opaqueSwitch"] = OpaqueSwitchJson(*opaque);
  if (auto port = FindDVPort(db, name)) json["dvport"] = DVPortJson(*port);
  if (json.size() == 1) return std::nullopt;
  return json;
}

}  // namespace TarnCtl::Admin::View

namespace TarnCtl::Admin {

std::string ShowJson(Store::Db& db, const std::optional<std::string>& name) {
  Instrument::Scope scope(db, "Show");
  Json json;
  if (!name) {
    json = {{"host", TextJson(db.path())}};
    json.update(View::WholeHost(db));
  } else if (auto named = View::Named(db, *name)) {
    json = std::move(*named);
  } else {
    throw NothingNamed(*name);
  }
  // Names keep the library's name rules, so are UTF-8; should a damaged
  // host hold other bytes, they are replaced rather than fail the output.
  return json.dump(2, ' ', false, Json::error_handler_t::replace) + "\n";
}

}  // namespace TarnCtl::Admin
