// The host as JSON: built from the same store accessors as the readable
// text (show.cc), one object per switch, port group and record.
#include "tarnctl/admin/show_json.h"

#include "hostctl/records.h"
#include "tarnctl/admin/host.h"
#include "tarnctl/admin/state.h"
#include "tarnctl/admin/text_json.h"
#include "tarnctl/instrument/call.h"
#include "tarnctl/instrument/errors.h"
#include "tarnctl/model/words.h"
#include "tarnctl/store/distributed.h"
#include "tarnctl/store/dvports.h"
#include "tarnctl/store/ens.h"
#include "tarnctl/store/faults.h"
#include "tarnctl/store/meta.h"
#include "tarnctl/store/opaque.h"
#include "tarnctl/store/pnics.h"
#include "tarnctl/store/portgroups.h"
#include "tarnctl/store/standard.h"
#include "tarnctl/store/timeouts.h"

namespace TarnCtl::Admin::View {
namespace {

using Store::Db;
using Store::Json;
using Store::Layer;

constexpr Layer kLayers[] = {Layer::kRunning, Layer::kStored};

const char* LayerKey(Layer layer) {
  return layer == Layer::kRunning ? "running" : "stored";
}

// Every field of the policy by name, and whether the uplink order is the
// object's own ("uplinkOrderSet", from flags) just before the order.
Json Teaming(const std::string& stored) {
  const Json full = PolicyJson(stored);
  Json json = Json::object();
  for (const auto& [key, value] : full.items()) {
    if (key == "uplinkOrder") {
      json["uplinkOrderSet"] = (full["flags"].get<uint64_t>() &
                                HostCtl::Network::NicTeamingPolicy::kUplinkOrderSet) != 0;
    }
    json[key] = value;
  }
  return json;
}

Json PortGroup(Db& db, const std::string& name, const Store::PortGroups::Row& row) {
  return {{"name", name},
          {"switch", row.switchName},
          {"vlan", row.vlan},
          {"clients", Store::PortGroups::Clients(db, name)},
          {"teaming", Teaming(row.policy)}};
}

Json StandardSwitch(Db& db, Layer layer, const std::string& name, const Store::Standard::Row& row) {
  Json groups = Json::array();
  for (const auto& group : Store::PortGroups::OnSwitch(db, layer, name)) {
    groups.push_back(PortGroup(db, group.name, group.row));
  }
  return {{"name", name},
          {"system", row.system},
          {"ports", row.numPorts},
          {"mtu", row.mtu},
          {"cdp", Model::CdpWord(row.cdp)},
          {"uplinks", Store::Standard::Uplinks(db, layer, name)},
          {"teaming", Teaming(row.policy)},
          {"portGroups", std::move(groups)}};
}

Json DistributedSwitch(Db& db, Layer layer, const std::string& name,
                       const Store::Distributed::Row& row) {
  Json uplinks = Json::array();
  for (const auto& uplink : Store::Distributed::Uplinks(db, layer, name)) {
    uplinks.push_back(
        {{"pnic", uplink.pnic}, {"dvport", uplink.portId ? Json(*uplink.portId) : Json(nullptr)}});
  }
  return {{"name", name},
          {"portset", row.portset},
          {"switchId", row.switchId},
          {"uuid", row.uuid},
          {"implClass", row.implClass},
          {"version", row.version},
          {"ports", row.numPorts},
          {"mtu", row.mtu},
          {"uplinks", std::move(uplinks)}};
}

Json DVPort(Db& db, const std::string& dvs, const Store::DVPorts::Port& port) {
  return {{"dvs", dvs},
          {"portId", port.portId},
          {"connectionId", port.connectionId},
          {"clients", Store::DVPorts::Clients(db, dvs, port.portId)}};
}

void AddTimeouts(Db& db, Layer layer, Json& into) {
  Json uplinks = Json::array(), lags = Json::array();
  for (const auto& record : Store::Timeouts::Uplinks(db, layer, {})) {
    uplinks.push_back({{"portset", record.portsetName},
                       {"uplink", record.uplinkName},
                       {"lagId", record.lagId},
                       {"timeout", record.timeout}});
  }
  for (const auto& record : Store::Timeouts::Lags(db, layer, {})) {
    lags.push_back(
        {{"portset", record.portsetName}, {"lagId", record.lagId}, {"timeout", record.timeout}});
  }
  into["uplinkTimeouts"] = std::move(uplinks);
  into["lagTimeouts"] = std::move(lags);
}

Json Layered(Db& db, Layer layer) {
  Json standard = Json::array(), distributed = Json::array();
  for (const auto& sw : Store::Standard::ListAll(db, layer)) {
    standard.push_back(StandardSwitch(db, layer, sw.name, sw.row));
  }
  for (const auto& dvs : Store::Distributed::List(db, layer)) {
    distributed.push_back(DistributedSwitch(db, layer, dvs.name, dvs.row));
  }
  Json json = {{"standardSwitches", std::move(standard)},
               {"distributedSwitches", std::move(distributed)}};
  if (layer == Layer::kRunning) {
    Json active = Json::array();
    for (const auto& ens : Store::Ens::List(db)) {
      active.push_back(
          {{"portset", ens.portset}, {"interrupt", ens.intr}, {"fastSwitch", ens.fastSwitch}});
    }
    json["ens"] = {{"activationNode", Store::Meta::EnsNodeSet(db)}, {"active", std::move(active)}};
  }
  AddTimeouts(db, layer, json);
  return json;
}

Json Faults(Db& db) {
  Json faults = Json::array();
  for (const auto& fault : Store::Faults::List(db)) {
    faults.push_back({{"operation", fault.operation},
                      {"on", fault.target ? TextJson(*fault.target) : Json(nullptr)},
                      {"message", TextJson(fault.message)},
                      {"detail", TextJson(fault.detail)},
                      {"skip", fault.skip},
                      {"times", fault.times}});
  }
  return faults;
}

// {"running": ..., "stored": ...} of what `find` finds in each layer (null
// where it finds nothing); nothing when it finds nothing in either.
template <typename Find, typename Make>
std::optional<Json> InLayers(Find find, Make make) {
  Json json = Json::object();
  bool found = false;
  for (const Layer layer : kLayers) {
    const auto row = find(layer);
    found = found || row.has_value();
    json[LayerKey(layer)] = row ? make(layer, *row) : Json(nullptr);
  }
  return found ? std::optional<Json>(std::move(json)) : std::nullopt;
}

}  // namespace

Json WholeHost(Db& db) {
  Json opaque = Json::array(), dvports = Json::array();
  for (const auto& sw : Store::Opaque::List(db)) {
    opaque.push_back({{"name", sw.name},
                      {"portset", sw.row.portset},
                      {"ports", sw.row.numPorts},
                      {"usedPorts", sw.row.usedPorts},
                      {"uplinks", sw.row.uplinks}});
  }
  for (const auto& [dvs, port] : Store::DVPorts::All(db)) dvports.push_back(DVPort(db, dvs, port));
  Json json = {{"pnics", Store::Pnics::Names(db)}};
  for (const Layer layer : kLayers) json[LayerKey(layer)] = Layered(db, layer);
  json["opaqueSwitches"] = std::move(opaque);
  json["dvports"] = std::move(dvports);
  json["events"] = Store::Ens::EventTexts(db);
  json["faults"] = Faults(db);
  return json;
}

std::optional<Json> Named(Db& db, const std::string& name) {
  Json json = {{"name", name}};
  auto add = [&](const char* kind, std::optional<Json> found) {
    if (found) json[kind] = std::move(*found);
  };
  add("standardSwitch",
      InLayers([&](Layer layer) { return Store::Standard::Find(db, layer, name); },
               [&](Layer layer, const auto& row) { return StandardSwitch(db, layer, name, row); }));
  add("distributedSwitch",
      InLayers(
          [&](Layer layer) { return Store::Distributed::Find(db, layer, name); },
          [&](Layer layer, const auto& row) { return DistributedSwitch(db, layer, name, row); }));
  if (json.contains("distributedSwitch")) {
    Json ports = Json::array();
    for (const auto& port : Store::DVPorts::OnSwitch(db, name)) {
      ports.push_back(DVPort(db, name, port));
    }
    json["distributedSwitch"]["dvports"] = std::move(ports);
  }
  add("portGroup", InLayers([&](Layer layer) { return Store::PortGroups::Find(db, layer, name); },
                            [&](Layer, const auto& row) { return PortGroup(db, name, row); }));
  if (json.size() == 1) return std::nullopt;
  return json;
}

}  // namespace TarnCtl::Admin::View

namespace TarnCtl::Admin {

std::string Host::ShowJson(const std::optional<std::string>& name) {
  Store::Db& db = state_->db();
  Instrument::Scope scope(db, "Show");
  Store::Json json;
  if (!name) {
    json = {{"host", TextJson(Path())}};
    json.update(View::WholeHost(db));
  } else if (auto named = View::Named(db, *name)) {
    json = std::move(*named);
  } else {
    throw Instrument::Refused(
        "No standard switch, distributed switch or port group is named " + *name,
        "in either layer");
  }
  // Names keep the library's name rules, so are UTF-8; should a damaged
  // host hold other bytes, they are replaced rather than fail the output.
  return json.dump(2, ' ', false, Store::Json::error_handler_t::replace) + "\n";
}

}  // namespace TarnCtl::Admin
