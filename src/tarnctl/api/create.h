// Creation of switches, shared by the library's AddVirtualSwitch and
// AddDVSwitch and by the host's administration (which adds system switches
// and plays the distributed switches' management plane): one set of rules
// for both.
#pragma once

#include <cstdint>
#include <string>

#include "hostctl/records.h"
#include "tarnctl/store/distributed.h"
#include "tarnctl/store/standard.h"

namespace TarnCtl::Api {

// Checks the new standard switch (name, ports, teaming policy) and makes it
// in both layers, replacing a stored switch of that name that is not
// running (with its port groups and links). Returns its row. REQUIRES: a
// Call or Scope names the operation.
Store::Standard::Row CreateStandardSwitch(Store::Db& db, const std::string& name, int64_t ports,
                                          const HostCtl::Network::NicTeamingPolicy& teaming,
                                          bool system);

struct NewDVSwitch {
  std::string name;
  std::string portset;
  std::string switchId;
  std::string uuid;
  std::string implClass;
  int64_t version = 0;
  int64_t ports = 0;
  int64_t mtu = 0;
};

// Checks the new switch (UUID, class, version, names, ports, MTU, a switch
// id no running switch has) and makes it in the running state and the
// cache, where it replaces the entries that share a name, portset name or
// switch id with it. REQUIRES: a Call or Scope names the operation.
void CreateDVSwitch(Store::Db& db, const NewDVSwitch& dvs);

}  // namespace TarnCtl::Api
