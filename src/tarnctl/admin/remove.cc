// Removing what seeding added: pnics, clients, system, distributed and
// opaque switches and DVPorts. The library's rules decide what may go: a
// switch goes as the library's RemoveVirtualSwitch removes it, and nothing
// goes that a switch, a link or a client still needs.
#include <string>

#include "tarnctl/admin/host.h"
#include "tarnctl/admin/state.h"
#include "tarnctl/api/remove.h"
#include "tarnctl/instrument/call.h"
#include "tarnctl/instrument/errors.h"
#include "tarnctl/model/names.h"
#include "tarnctl/store/distributed.h"
#include "tarnctl/store/dvports.h"
#include "tarnctl/store/opaque.h"
#include "tarnctl/store/pnics.h"
#include "tarnctl/store/portgroups.h"
#include "tarnctl/store/standard.h"
#include "tarnctl/store/transaction.h"

namespace TarnCtl::Admin {

using Instrument::Refused;
using Instrument::Scope;
using Store::Layer;
using Store::Transaction;

void Host::RemovePnic(const std::string& name) {
  Store::Db& db = state_->db();
  Scope scope(db, "RemovePnic");
  Model::CheckRemovablePnic(db, name);
  Transaction transaction(db);
  Store::Pnics::Delete(db, name);
  transaction.Commit();
}

void Host::RemoveClient(const std::string& portGroup, const std::string& client) {
  Store::Db& db = state_->db();
  Scope scope(db, "RemoveClient");
  if (!Store::PortGroups::HasClient(db, portGroup, client)) {
    throw Refused("Client " + client + " is not on portgroup " + portGroup);
  }
  Transaction transaction(db);
  Store::PortGroups::RemoveClient(db, portGroup, client);
  transaction.Commit();
}

void Host::RemoveSystemSwitch(const std::string& name) {
  Store::Db& db = state_->db();
  Scope scope(db, "RemoveSystemSwitch");
  const auto row = Store::Standard::Find(db, Layer::kRunning, name);
  if (!row) throw Refused("System switch " + name + " does not exist");
  if (!row->system) {
    throw Refused("Virtual switch " + name + " is not a system switch",
                  "(orvocfg-vswitch -d removes it)");
  }
  Api::RemoveStandardSwitch(db, name);
}

void Host::RemoveDVSwitch(const std::string& name) {
  Store::Db& db = state_->db();
  Scope scope(db, "RemoveDVSwitch");
  const auto row = Store::Distributed::Find(db, Layer::kRunning, name);
  if (!row) throw Refused("DVS " + name + " does not exist");
  Api::RemoveDVSwitch(db, name, row->portset);
}

void Host::RemoveDVPort(const std::string& dvs, const std::string& portId) {
  Store::Db& db = state_->db();
  Scope scope(db, "RemoveDVPort");
  const std::string port = "DVPort " + portId + " on " + dvs;
  if (!Store::DVPorts::ConnectionId(db, dvs, portId)) {
    throw Refused("DVPort " + portId + " does not exist on " + dvs);
  }
  if (const auto clients = Store::DVPorts::Clients(db, dvs, portId); !clients.empty()) {
    throw Refused(port + " is in use", "(clients: " + std::to_string(clients.size()) + ")");
  }
  for (const Layer layer : Store::kBothLayers) {
    for (const auto& uplink : Store::Distributed::Uplinks(db, layer, dvs)) {
      if (uplink.portId == portId) throw Refused(port + " holds uplink " + uplink.pnic);
    }
  }
  Transaction transaction(db);
  Store::DVPorts::Delete(db, dvs, portId);
  transaction.Commit();
}

void Host::RemoveOpaqueSwitch(const std::string& name) {
  Store::Db& db = state_->db();
  Scope scope(db, "RemoveOpaqueSwitch");
  if (!Store::Opaque::Find(db, name)) throw Refused("Opaque switch " + name + " does not exist");
  Transaction transaction(db);
  Store::Opaque::Delete(db, name);
  transaction.Commit();
}

}  // namespace TarnCtl::Admin
