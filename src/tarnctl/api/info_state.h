// What the network information and switch information objects hold: the
// process's session, for their whole lifetime.
#pragma once

#include <memory>

#include "hostctl/tarnctl.h"
#include "tarnctl/api/session.h"

namespace TarnCtl::Network {

struct NetworkInfoImpl::State {
  std::shared_ptr<Api::Session> session;
  Store::Db& db() const { return session->db(); }
};

struct VirtualSwitchInfoImpl::State {
  std::shared_ptr<Api::Session> session;
  Store::Db& db() const { return session->db(); }
};

}  // namespace TarnCtl::Network
