// Standard switches with their port groups and the clients on them: system
// switches added and removed as the host's own, clients as machines that
// plug in; one reading of them in a layer, printed as text, JSON and rows.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "tarnctl/admin/view.h"
#include "tarnctl/store/layer.h"
#include "tarnctl/store/portgroups.h"
#include "tarnctl/store/standard.h"

namespace TarnCtl::Admin {

struct PortGroup {
  std::string name;
  Store::PortGroups::Row row;
  std::vector<std::string> clients;
};

struct StandardSwitch {
  std::string name;
  Store::Standard::Row row;
  std::vector<std::string> uplinks;
  std::vector<PortGroup> portGroups;
};

// The standard switches of `layer` in creation order, system switches
// among them; one of them; a port group.
std::vector<StandardSwitch> StandardSwitches(Store::Db& db, Store::Layer layer);
std::optional<StandardSwitch> FindStandardSwitch(Store::Db& db, Store::Layer layer,
                                                 const std::string& name);
std::optional<PortGroup> FindPortGroup(Store::Db& db, Store::Layer layer, const std::string& name);
// Names in the running state, as completion offers them.
std::vector<std::string> StandardSwitchNames(Store::Db& db);
std::vector<std::string> PortGroupNames(Store::Db& db);

void AddSystemSwitch(Store::Db& db, const std::string& name, int32_t ports);
// Goes as the library's RemoveVirtualSwitch removes a switch.
void RemoveSystemSwitch(Store::Db& db, const std::string& name);
void AddClient(Store::Db& db, const std::string& portGroup, const std::string& client);
void RemoveClient(Store::Db& db, const std::string& portGroup, const std::string& client);

// System switches: name, ports, used ports, uplinks.
std::vector<ListRow> ListSystemSwitches(Store::Db& db);
// Port group, client.
std::vector<ListRow> ListClients(Store::Db& db);

// The lines of `tarnhost show` for a switch and its port groups (link
// criteria left out).
std::string StandardSwitchText(const StandardSwitch& sw);
std::string PortGroupText(const PortGroup& group);
Json StandardSwitchJson(const StandardSwitch& sw);
Json PortGroupJson(const PortGroup& group);

}  // namespace TarnCtl::Admin
