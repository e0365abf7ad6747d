// Seeding the host with what the tool cannot create itself: pnics, clients,
// system switches, distributed switches (as their management plane would),
// DVPorts and opaque switches. Each call applies the library's rules and is
// undone whole when one refuses.
#include <set>
#include <string>

#include "tarnctl/admin/host.h"
#include "tarnctl/admin/state.h"
#include "tarnctl/api/create.h"
#include "tarnctl/instrument/call.h"
#include "tarnctl/instrument/errors.h"
#include "tarnctl/model/capacity.h"
#include "tarnctl/model/limits.h"
#include "tarnctl/model/names.h"
#include "tarnctl/model/teaming.h"
#include "tarnctl/model/words.h"
#include "tarnctl/store/distributed.h"
#include "tarnctl/store/dvports.h"
#include "tarnctl/store/meta.h"
#include "tarnctl/store/opaque.h"
#include "tarnctl/store/pnics.h"
#include "tarnctl/store/portgroups.h"
#include "tarnctl/store/transaction.h"

namespace TarnCtl::Admin {

using Instrument::Refused;
using Instrument::Scope;
using Model::NameKind;
using Store::Layer;
using Store::Transaction;

namespace {

// Uplinks of a new distributed or opaque switch: existing, free, each once.
void CheckUplinks(Store::Db& db, const std::vector<std::string>& uplinks) {
  std::set<std::string> seen;
  for (const auto& uplink : uplinks) {
    if (!seen.insert(uplink).second) throw Refused("Uplink " + uplink + " is given twice");
    Model::CheckFreePnic(db, uplink);
  }
}

// Client names of one port: valid, each once.
void CheckClients(const std::vector<std::string>& clients) {
  std::set<std::string> seen;
  for (const auto& client : clients) {
    Model::CheckName(NameKind::kClient, client);
    if (!seen.insert(client).second) throw Refused("Client " + client + " is given twice");
  }
}

}  // namespace

void Host::AddPnic(const std::string& name) {
  Store::Db& db = state_->db();
  Scope scope(db, "AddPnic");
  Model::CheckName(NameKind::kPnic, name);
  if (Store::Pnics::Exists(db, name)) throw Refused("Pnic " + name + " already exists");
  Transaction transaction(db);
  Store::Pnics::Insert(db, name, Store::Meta::NextSeq(db));
  transaction.Commit();
}

void Host::AddClient(const std::string& portGroup, const std::string& client) {
  Store::Db& db = state_->db();
  Scope scope(db, "AddClient");
  Model::CheckName(NameKind::kClient, client);
  const auto group = Store::PortGroups::Find(db, Layer::kRunning, portGroup);
  if (!group) throw Refused("Portgroup " + portGroup + " does not exist");
  if (Store::PortGroups::HasClient(db, portGroup, client)) {
    throw Refused("Client " + client + " is already on portgroup " + portGroup);
  }
  Model::CheckStandardFreePort(db, group->switchName);
  Transaction transaction(db);
  Store::PortGroups::AddClient(db, portGroup, client, Store::Meta::NextSeq(db));
  transaction.Commit();
}

void Host::AddSystemSwitch(const std::string& name, int32_t ports) {
  Store::Db& db = state_->db();
  Scope scope(db, "AddSystemSwitch");
  Api::CreateStandardSwitch(db, name, ports, Model::NewSystemSwitchPolicy(), true);
}

void Host::AddDVSwitch(const DVSwitchSeed& seed) {
  Store::Db& db = state_->db();
  Scope scope(db, "AddDVSwitch");
  Model::CheckName(NameKind::kSwitch, seed.name);
  std::string id;
  if (seed.switchId) {
    id = *seed.switchId;
  } else {
    id = "dvs-" + seed.name;
    for (int n = 2; Store::Distributed::NameOfSwitchId(db, Layer::kRunning, id); ++n) {
      id = "dvs-" + seed.name + "-" + std::to_string(n);
    }
  }
  CheckUplinks(db, seed.uplinks);
  Transaction transaction(db);
  Api::CreateDVSwitch(
      db, {seed.name, seed.portset.value_or(seed.name), id, Model::UuidOfName(seed.name),
           Model::kImplClasses[0], 0, seed.ports, seed.mtu});
  for (const auto& uplink : seed.uplinks) {
    const int64_t seq = Store::Meta::NextSeq(db);
    for (Layer layer : Store::kBothLayers) {
      Store::Distributed::AddUplink(db, layer, seed.name, {uplink, std::nullopt}, seq);
    }
  }
  transaction.Commit();
}

void Host::AddDVPort(const DVPortSeed& seed) {
  Store::Db& db = state_->db();
  Scope scope(db, "AddDVPort");
  if (!Store::Distributed::Find(db, Layer::kRunning, seed.dvs)) {
    throw Refused("DVS " + seed.dvs + " does not exist");
  }
  Model::CheckName(NameKind::kDVPort, seed.portId);
  if (Store::DVPorts::ConnectionId(db, seed.dvs, seed.portId)) {
    throw Refused("DVPort " + seed.portId + " already exists on " + seed.dvs);
  }
  Model::CheckDistributedFreePort(db, seed.dvs);
  CheckClients(seed.clients);
  Transaction transaction(db);
  Store::DVPorts::Insert(db, seed.dvs, {seed.portId, seed.connectionId}, Store::Meta::NextSeq(db));
  for (const auto& client : seed.clients) {
    Store::DVPorts::AddClient(db, seed.dvs, seed.portId, client, Store::Meta::NextSeq(db));
  }
  transaction.Commit();
}

void Host::AddOpaqueSwitch(const OpaqueSeed& seed) {
  Store::Db& db = state_->db();
  Scope scope(db, "AddOpaqueSwitch");
  const std::string portset = seed.portset.value_or(seed.name);
  Model::CheckNewSwitchName(db, NameKind::kSwitch, seed.name);
  if (portset != seed.name) Model::CheckNewSwitchName(db, NameKind::kPortset, portset);
  Model::Check(Model::kPorts, seed.ports);
  Model::Check(Model::kUsedPorts, seed.used, seed.ports);
  CheckUplinks(db, seed.uplinks);
  Transaction transaction(db);
  Store::Opaque::Insert(
      db, seed.name, Store::Meta::NextSeq(db),
      {portset, static_cast<uint32_t>(seed.ports), static_cast<uint32_t>(seed.used), seed.uplinks});
  transaction.Commit();
}

}  // namespace TarnCtl::Admin
