#include "tarnctl/api/remove.h"

#include "tarnctl/instrument/errors.h"
#include "tarnctl/store/distributed.h"
#include "tarnctl/store/standard.h"
#include "tarnctl/store/transaction.h"

namespace TarnCtl::Api {

using Instrument::Refused;

void RemoveStandardSwitch(Store::Db& db, const std::string& name) {
  if (const int64_t used = Store::Standard::ClientCount(db, name); used > 0) {
    throw Refused("Virtual switch " + name + " has " + std::to_string(used) + " ports in use");
  }
  // Administration makes this change outside any operation's savepoint:
  // it is made whole here.
  Store::Transaction transaction(db);
  Store::Standard::Delete(db, name);
  transaction.Commit();
}

void RemoveDVSwitch(Store::Db& db, const std::string& name, const std::string& portset) {
  if (const int64_t used = Store::Distributed::PortsInUse(db, name); used > 0) {
    throw Refused("DVS " + name + " has " + std::to_string(used) + " ports in use");
  }
  // Administration makes this change outside any operation's savepoint:
  // it is made whole here.
  Store::Transaction transaction(db);
  Store::Distributed::Delete(db, name, portset);
  transaction.Commit();
}

}  // namespace TarnCtl::Api
