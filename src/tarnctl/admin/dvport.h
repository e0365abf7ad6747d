// DVPorts of distributed switches, with the clients on them; one reading,
// printed as text, JSON and rows.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "tarnctl/admin/view.h"

namespace TarnCtl::Store {
class Db;
}

namespace TarnCtl::Admin {

struct DVPort {
  std::string dvs;
  std::string portId;
  uint32_t connectionId = 0;
  std::vector<std::string> clients;

  bool operator==(const DVPort&) const = default;
};

struct DVPortSeed {
  std::string dvs;  // switch name
  std::string portId;
  std::vector<std::string> clients;
  uint32_t connectionId = 0;
};

// Every DVPort, in creation order; those of one switch.
std::vector<DVPort> DVPorts(Store::Db& db);
std::vector<DVPort> DVPortsOn(Store::Db& db, const std::string& dvs);

void AddDVPort(Store::Db& db, const DVPortSeed& seed);
// Refuses a port with clients or one that holds an uplink in either layer.
void RemoveDVPort(Store::Db& db, const std::string& dvs, const std::string& portId);

// Switch, port id, connection id, uplinks, then a field per client.
std::vector<ListRow> ListDVPorts(Store::Db& db);

// "DVS:PORTID", the name show takes; the DVPort of such a name.
std::string DVPortName(const std::string& dvs, const std::string& portId);
std::optional<DVPort> FindDVPort(Store::Db& db, const std::string& name);

std::string DVPortText(const DVPort& port);
Json DVPortJson(const DVPort& port);

}  // namespace TarnCtl::Admin
