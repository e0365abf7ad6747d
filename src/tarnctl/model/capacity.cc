#include "tarnctl/model/capacity.h"

#include "tarnctl/instrument/errors.h"
#include "tarnctl/store/distributed.h"
#include "tarnctl/store/dvports.h"
#include "tarnctl/store/standard.h"

namespace TarnCtl::Model {

namespace {

void CheckFree(const std::string& name, int64_t used, int64_t ports) {
  if (used >= ports) throw Instrument::Refused("Switch " + name + " has no free port");
}

}  // namespace

void CheckStandardFreePort(Store::Db& db, const std::string& name) {
  const auto row = Store::Standard::Find(db, Store::Layer::kRunning, name);
  CheckFree(name, Store::Standard::UsedPorts(db, name), row ? row->numPorts : 0);
}

void CheckDistributedFreePort(Store::Db& db, const std::string& name) {
  const auto row = Store::Distributed::Find(db, Store::Layer::kRunning, name);
  CheckFree(name, Store::DVPorts::Count(db, name), row ? row->numPorts : 0);
}

}  // namespace TarnCtl::Model
