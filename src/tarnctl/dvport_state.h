// What a DVPort object holds: the session, its key, and the name of the
// distributed switch that the key's switch id names ("" when none does).
#pragma once

#include <memory>
#include <string>

#include "hostctl/tarnctl.h"
#include "tarnctl/session.h"

namespace TarnCtl::Network {

struct DVPortImpl::State {
  std::shared_ptr<Detail::Session> session;
  HostCtl::Network::DVPortParam param;
  std::string dvs;
};

}  // namespace TarnCtl::Network
