#include "tarnctl/store/names.h"

#include "tarnctl/store/db.h"

namespace TarnCtl::Store::Names {

bool SwitchNameTaken(Db& db, const std::string& name) {
  return db
      .Prepare(
          "SELECT 1 FROM vswitch WHERE layer = 1 AND name = ?1"
          " UNION ALL SELECT 1 FROM dvswitch WHERE layer = 1 AND name = ?1"
          " UNION ALL SELECT 1 FROM dvswitch WHERE layer = 1 AND portset = ?1"
          " UNION ALL SELECT 1 FROM opaque WHERE name = ?1 OR portset = ?1")
      .Bind(1, name)
      .Step();
}

bool VirtualSwitchExists(Db& db, const std::string& name) {
  return db
      .Prepare(
          "SELECT 1 FROM vswitch WHERE layer = 1 AND name = ?1"
          " UNION ALL SELECT 1 FROM dvswitch WHERE layer = 1 AND name = ?1")
      .Bind(1, name)
      .Step();
}

}  // namespace TarnCtl::Store::Names
