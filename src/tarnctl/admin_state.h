// What an Admin::Host holds: the process's session (and with it the lock).
#pragma once

#include <memory>

#include "tarnctl/admin.h"
#include "tarnctl/session.h"

namespace TarnCtl::Admin {

struct Host::State {
  std::shared_ptr<Detail::Session> session;
};

}  // namespace TarnCtl::Admin
