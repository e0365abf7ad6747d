// Ports as a resource: a switch has no more users than ports. A standard
// switch's ports are used by its running links and the clients of its
// running port groups; a distributed switch holds at most its number of
// ports of DVPorts.
#pragma once

#include <string>

namespace TarnCtl::Store {
class Db;
}

namespace TarnCtl::Model {

// Refuses when the running standard switch `name` has no free port.
void CheckStandardFreePort(Store::Db& db, const std::string& name);
// Refuses when the running distributed switch `name` holds as many DVPorts
// as it has ports.
void CheckDistributedFreePort(Store::Db& db, const std::string& name);

}  // namespace TarnCtl::Model
