#include "tarnctl/admin/dvport.h"

#include <set>

#include "tarnctl/admin/distributed.h"
#include "tarnctl/instrument/call.h"
#include "tarnctl/instrument/errors.h"
#include "tarnctl/model/capacity.h"
#include "tarnctl/model/names.h"
#include "tarnctl/store/dvports.h"
#include "tarnctl/store/meta.h"
#include "tarnctl/store/transaction.h"

namespace TarnCtl::Admin {
namespace {

using Instrument::Refused;
using Instrument::Scope;
using Store::Layer;

DVPort Read(Store::Db& db, const std::string& dvs, Store::DVPorts::Port port) {
  auto clients = Store::DVPorts::Clients(db, dvs, port.portId);
  return {dvs, std::move(port.portId), port.connectionId, std::move(clients)};
}

// Client names of one port: valid, each once.
void CheckClients(const std::vector<std::string>& clients) {
  std::set<std::string> seen;
  for (const auto& client : clients) {
    Model::CheckName(Model::NameKind::kClient, client);
    if (!seen.insert(client).second) throw Refused("Client " + client + " is given twice");
  }
}

}  // namespace

std::vector<DVPort> DVPorts(Store::Db& db) {
  std::vector<DVPort> ports;
  for (auto& [dvs, port] : Store::DVPorts::All(db)) ports.push_back(Read(db, dvs, std::move(port)));
  return ports;
}

std::string DVPortName(const std::string& dvs, const std::string& portId) {
  return dvs + ":" + portId;
}

std::optional<DVPort> FindDVPort(Store::Db& db, const std::string& name) {
  // Port ids may hold a ':', switch names may too: every split is tried.
  for (auto colon = name.find(':'); colon != std::string::npos; colon = name.find(':', colon + 1)) {
    for (auto& port : DVPortsOn(db, name.substr(0, colon))) {
      if (port.portId == name.substr(colon + 1)) return port;
    }
  }
  return std::nullopt;
}

std::vector<DVPort> DVPortsOn(Store::Db& db, const std::string& dvs) {
  std::vector<DVPort> ports;
  for (auto& port : Store::DVPorts::OnSwitch(db, dvs)) ports.push_back(Read(db, dvs, port));
  return ports;
}

void AddDVPort(Store::Db& db, const DVPortSeed& seed) {
  Scope scope(db, "AddDVPort");
  if (!FindDVSwitch(db, Layer::kRunning, seed.dvs)) {
    throw Refused("DVS " + seed.dvs + " does not exist");
  }
  Model::CheckName(Model::NameKind::kDVPort, seed.portId);
  if (Store::DVPorts::ConnectionId(db, seed.dvs, seed.portId)) {
    throw Refused("DVPort " + seed.portId + " already exists on " + seed.dvs);
  }
  Model::CheckDistributedFreePort(db, seed.dvs);
  CheckClients(seed.clients);
  Store::Transaction transaction(db);
  Store::DVPorts::Insert(db, seed.dvs, {seed.portId, seed.connectionId}, Store::Meta::NextSeq(db));
  for (const auto& client : seed.clients) {
    Store::DVPorts::AddClient(db, seed.dvs, seed.portId, client, Store::Meta::NextSeq(db));
  }
  transaction.Commit();
}

void RemoveDVPort(Store::Db& db, const std::string& dvs, const std::string& portId) {
  Scope scope(db, "RemoveDVPort");
  const std::string port = "DVPort " + portId + " on " + dvs;
  if (!Store::DVPorts::ConnectionId(db, dvs, portId)) {
    throw Refused("DVPort " + portId + " does not exist on " + dvs);
  }
  if (const auto clients = Store::DVPorts::Clients(db, dvs, portId); !clients.empty()) {
    throw Refused(port + " is in use", "(clients: " + std::to_string(clients.size()) + ")");
  }
  for (const Layer layer : Store::kBothLayers) {
    const auto sw = FindDVSwitch(db, layer, dvs);
    if (!sw) continue;
    for (const auto& uplink : sw->uplinks) {
      if (uplink.portId == portId) throw Refused(port + " holds uplink " + uplink.pnic);
    }
  }
  Store::Transaction transaction(db);
  Store::DVPorts::Delete(db, dvs, portId);
  transaction.Commit();
}

std::vector<ListRow> ListDVPorts(Store::Db& db) {
  std::vector<ListRow> rows;
  for (auto& port : DVPorts(db)) {
    std::vector<std::string> pnics;
    if (const auto sw = FindDVSwitch(db, Layer::kRunning, port.dvs)) {
      for (const auto& uplink : sw->uplinks) {
        if (uplink.portId == port.portId) pnics.push_back(uplink.pnic);
      }
    }
    ListRow row{port.dvs, port.portId, std::to_string(port.connectionId), Join(pnics, ",")};
    for (auto& client : port.clients) row.push_back(std::move(client));
    rows.push_back(std::move(row));
  }
  return rows;
}

std::string DVPortText(const DVPort& port) {
  return port.dvs + " port " + port.portId + ": connection id " +
         std::to_string(port.connectionId) + ", clients " + Listed(port.clients);
}

Json DVPortJson(const DVPort& port) {
  return {{"dvs", port.dvs},
          {"portId", port.portId},
          {"connectionId", port.connectionId},
          {"clients", port.clients}};
}

}  // namespace TarnCtl::Admin
