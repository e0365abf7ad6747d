// Name questions that span the switch tables (running state).
#pragma once

#include <string>

namespace TarnCtl::Store {
class Db;
}

namespace TarnCtl::Store::Names {

// A running standard switch, distributed switch or portset name, or opaque
// switch or portset name is `name`.
bool SwitchNameTaken(Db& db, const std::string& name);
// A running standard or distributed switch is called `name`.
bool VirtualSwitchExists(Db& db, const std::string& name);

}  // namespace TarnCtl::Store::Names
