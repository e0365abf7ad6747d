#include "tarnctl/admin/standard.h"

#include <cstdio>

#include "hostctl/records.h"
#include "tarnctl/api/create.h"
#include "tarnctl/api/remove.h"
#include "tarnctl/instrument/call.h"
#include "tarnctl/instrument/errors.h"
#include "tarnctl/model/capacity.h"
#include "tarnctl/model/names.h"
#include "tarnctl/model/teaming.h"
#include "tarnctl/model/words.h"
#include "tarnctl/store/meta.h"
#include "tarnctl/store/policy_codec.h"
#include "tarnctl/store/teaming_fields.h"
#include "tarnctl/store/transaction.h"

namespace TarnCtl::Admin {
namespace {

using Instrument::Refused;
using Instrument::Scope;
using Store::Layer;

std::vector<PortGroup> PortGroupsOn(Store::Db& db, Layer layer, const std::string& sw) {
  std::vector<PortGroup> groups;
  for (auto& group : Store::PortGroups::OnSwitch(db, layer, sw)) {
    auto clients = Store::PortGroups::Clients(db, group.name);
    groups.push_back({std::move(group.name), std::move(group.row), std::move(clients)});
  }
  return groups;
}

StandardSwitch Read(Store::Db& db, Layer layer, std::string name, Store::Standard::Row row) {
  auto uplinks = Store::Standard::Uplinks(db, layer, name);
  auto groups = PortGroupsOn(db, layer, name);
  return {std::move(name), std::move(row), std::move(uplinks), std::move(groups)};
}

// The fields of a teaming policy that people read, as "label value" pairs.
class TeamingWriter {
 public:
  std::vector<std::string> fields;  // "label value"

  template <typename T>
  void Number(const char* key, const T& value) {
    const std::string field = key;
    if (field == "flags") {
      char hex[32];
      std::snprintf(hex, sizeof hex, "0x%llx", static_cast<unsigned long long>(value));
      ordered_ = value & HostCtl::Network::NicTeamingPolicy::kUplinkOrderSet;
      Add("flags", hex);
    } else {
      Add(field == "maxActive" ? "max active" : key, std::to_string(value));
    }
  }
  void Names(const char*, const std::vector<std::string>& names) {
    Add("order", ordered_ ? Listed(names) : "(not set)");
  }
  template <typename Inside>
  void Group(const char*, Inside) {}  // link criteria: left out

 private:
  void Add(const std::string& label, const std::string& value) {
    fields.push_back(label + " " + value);
  }
  bool ordered_ = false;
};

std::string TeamingText(const std::string& stored) {
  TeamingWriter writer;
  const auto policy = Store::DecodeTeamingPolicy(stored);
  Store::VisitTeamingFields(policy, writer);
  return "Teaming: " + Join(writer.fields, ", ");
}

// Every field of the policy by name, and whether the uplink order is the
// object's own ("uplinkOrderSet", from flags) just before the order.
Json TeamingJson(const std::string& stored) {
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

}  // namespace

std::vector<StandardSwitch> StandardSwitches(Store::Db& db, Layer layer) {
  std::vector<StandardSwitch> switches;
  for (auto& sw : Store::Standard::ListAll(db, layer)) {
    switches.push_back(Read(db, layer, std::move(sw.name), std::move(sw.row)));
  }
  return switches;
}

std::optional<StandardSwitch> FindStandardSwitch(Store::Db& db, Layer layer,
                                                 const std::string& name) {
  auto row = Store::Standard::Find(db, layer, name);
  if (!row) return std::nullopt;
  return Read(db, layer, name, std::move(*row));
}

std::optional<PortGroup> FindPortGroup(Store::Db& db, Layer layer, const std::string& name) {
  auto row = Store::PortGroups::Find(db, layer, name);
  if (!row) return std::nullopt;
  return PortGroup{name, std::move(*row), Store::PortGroups::Clients(db, name)};
}

std::vector<std::string> StandardSwitchNames(Store::Db& db) {
  std::vector<std::string> names;
  for (auto& sw : Store::Standard::ListAll(db, Layer::kRunning)) names.push_back(sw.name);
  return names;
}

std::vector<std::string> PortGroupNames(Store::Db& db) {
  return Store::PortGroups::Names(db, Layer::kRunning);
}

void AddSystemSwitch(Store::Db& db, const std::string& name, int32_t ports) {
  Scope scope(db, "AddSystemSwitch");
  Api::CreateStandardSwitch(db, name, ports, Model::DefaultTeamingPolicy(), true);
}

void RemoveSystemSwitch(Store::Db& db, const std::string& name) {
  Scope scope(db, "RemoveSystemSwitch");
  const auto row = Store::Standard::Find(db, Layer::kRunning, name);
  if (!row) throw Refused("System switch " + name + " does not exist");
  if (!row->system) {
    throw Refused("Virtual switch " + name + " is not a system switch",
                  "(orvocfg-vswitch -d removes it)");
  }
  Api::RemoveStandardSwitch(db, name);
}

void AddClient(Store::Db& db, const std::string& portGroup, const std::string& client) {
  Scope scope(db, "AddClient");
  Model::CheckName(Model::NameKind::kClient, client);
  const auto group = Store::PortGroups::Find(db, Layer::kRunning, portGroup);
  if (!group) throw Refused("Portgroup " + portGroup + " does not exist");
  if (Store::PortGroups::HasClient(db, portGroup, client)) {
    throw Refused("Client " + client + " is already on portgroup " + portGroup);
  }
  Model::CheckStandardFreePort(db, group->switchName);
  Store::Transaction transaction(db);
  Store::PortGroups::AddClient(db, portGroup, client, Store::Meta::NextSeq(db));
  transaction.Commit();
}

void RemoveClient(Store::Db& db, const std::string& portGroup, const std::string& client) {
  Scope scope(db, "RemoveClient");
  if (!Store::PortGroups::HasClient(db, portGroup, client)) {
    throw Refused("Client " + client + " is not on portgroup " + portGroup);
  }
  Store::Transaction transaction(db);
  Store::PortGroups::RemoveClient(db, portGroup, client);
  transaction.Commit();
}

std::vector<ListRow> ListSystemSwitches(Store::Db& db) {
  std::vector<ListRow> rows;
  for (const auto& sw : Store::Standard::List(db, Layer::kRunning, true)) {
    rows.push_back({sw.name, std::to_string(sw.row.numPorts),
                    std::to_string(Store::Standard::UsedPorts(db, sw.name)),
                    Join(Store::Standard::Uplinks(db, Layer::kRunning, sw.name), ",")});
  }
  return rows;
}

std::vector<ListRow> ListClients(Store::Db& db) {
  std::vector<ListRow> rows;
  for (auto& client : Store::PortGroups::AllClients(db)) {
    rows.push_back({std::move(client.portGroup), std::move(client.name)});
  }
  return rows;
}

std::string StandardSwitchText(const StandardSwitch& sw) {
  std::string out = "  Standard switch " + sw.name + (sw.row.system ? " (system)" : "") + ": " +
                    std::to_string(sw.row.numPorts) + " ports, MTU " + std::to_string(sw.row.mtu) +
                    ", CDP " + Model::CdpWord(sw.row.cdp) + "\n";
  out += "    Uplinks: " + Listed(sw.uplinks) + "\n";
  out += "    " + TeamingText(sw.row.policy) + "\n";
  for (const auto& group : sw.portGroups) out += PortGroupText(group);
  return out;
}

std::string PortGroupText(const PortGroup& group) {
  return "    Port group " + group.name + ": VLAN " + std::to_string(group.row.vlan) +
         ", clients " + Listed(group.clients) + "\n      " + TeamingText(group.row.policy) + "\n";
}

Json PortGroupJson(const PortGroup& group) {
  return {{"name", group.name},
          {"switch", group.row.switchName},
          {"vlan", group.row.vlan},
          {"clients", group.clients},
          {"teaming", TeamingJson(group.row.policy)}};
}

Json StandardSwitchJson(const StandardSwitch& sw) {
  Json groups = Json::array();
  for (const auto& group : sw.portGroups) groups.push_back(PortGroupJson(group));
  return {{"name", sw.name},
          {"system", sw.row.system},
          {"ports", sw.row.numPorts},
          {"mtu", sw.row.mtu},
          {"cdp", Model::CdpWord(sw.row.cdp)},
          {"uplinks", sw.uplinks},
          {"teaming", TeamingJson(sw.row.policy)},
          {"portGroups", std::move(groups)}};
}

}  // namespace TarnCtl::Admin
