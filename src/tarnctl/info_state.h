// What the network information and switch information objects hold: the
// process's session, for their whole lifetime.
#pragma once

#include <memory>

#include "hostctl/tarnctl.h"
#include "tarnctl/session.h"

namespace TarnCtl::Network {

struct NetworkInfoImpl::State {
  std::shared_ptr<Detail::Session> session;
};

struct VirtualSwitchInfoImpl::State {
  std::shared_ptr<Detail::Session> session;
};

}  // namespace TarnCtl::Network
