// What a port group object holds: the session, its name and a snapshot of
// its running row.
#pragma once

#include <memory>
#include <string>

#include "hostctl/tarnctl.h"
#include "tarnctl/api/session.h"
#include "tarnctl/instrument/call.h"
#include "tarnctl/store/portgroups.h"
#include "tarnctl/store/snapshot.h"

namespace TarnCtl::Network {

struct PortGroupImpl::State {
  State(std::shared_ptr<Api::Session> s, std::string n)
      : session(std::move(s)), name(std::move(n)) {}
  State(std::shared_ptr<Api::Session> s, std::string n, Store::PortGroups::Row row)
      : session(std::move(s)), name(std::move(n)), row(db(), std::move(row)) {}

  Store::Db& db() const { return session->db(); }
  Instrument::Target CallTarget() const { return Instrument::On(name); }
  // The running row; refuses when the port group no longer exists.
  const Store::PortGroups::Row& Row();
  // Refuses when the port group no longer exists.
  void EnsureStillExists() { Row(); }

  std::shared_ptr<Api::Session> session;
  std::string name;
  Store::Snapshot<Store::PortGroups::Row> row;
};

}  // namespace TarnCtl::Network
