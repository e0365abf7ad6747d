// What an Admin::Host holds: the process's session (and with it the lock).
#pragma once

#include <memory>

#include "tarnctl/admin/host.h"
#include "tarnctl/api/session.h"

namespace TarnCtl::Admin {

struct Host::State {
  std::shared_ptr<Api::Session> session;
  Store::Db& db() const { return session->db(); }
};

}  // namespace TarnCtl::Admin
