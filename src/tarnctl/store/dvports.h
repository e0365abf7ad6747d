// DVPorts of distributed switches (table dvport, by switch name; not
// layered), their clients (dvport_client) and the test events raised on
// them (dvport_event).
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

namespace TarnCtl::Store {
class Db;
}

namespace TarnCtl::Store::DVPorts {

struct Port {
  std::string portId;
  uint32_t connectionId = 0;
};

// The port's connection id, or nothing when the switch has no such port.
std::optional<uint32_t> ConnectionId(Db& db, const std::string& dvs, const std::string& portId);
void Insert(Db& db, const std::string& dvs, const Port& port, int64_t seq);
void SetConnectionId(Db& db, const std::string& dvs, const std::string& portId,
                     uint32_t connectionId);
// With its clients.
void Delete(Db& db, const std::string& dvs, const std::string& portId);
// In the order they were made.
std::vector<Port> OnSwitch(Db& db, const std::string& dvs);
int64_t Count(Db& db, const std::string& dvs);
struct OnAnySwitch {
  std::string dvs;
  Port port;
};
// Every DVPort of the host, of running switches or not, in the order they
// were made.
std::vector<OnAnySwitch> All(Db& db);

void AddClient(Db& db, const std::string& dvs, const std::string& portId, const std::string& client,
               int64_t seq);
// In the order they were added.
std::vector<std::string> Clients(Db& db, const std::string& dvs, const std::string& portId);

void AddEvent(Db& db, const std::string& dvs, const std::string& portId, const std::string& kind,
              int64_t seq);

}  // namespace TarnCtl::Store::DVPorts
