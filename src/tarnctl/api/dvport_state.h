// What a DVPort object holds: the session, its key, and the name of the
// distributed switch that the key's switch id names ("" when none does).
#pragma once

#include <memory>
#include <string>

#include "hostctl/tarnctl.h"
#include "tarnctl/api/session.h"
#include "tarnctl/instrument/call.h"

namespace TarnCtl::Network {

struct DVPortImpl::State {
  Store::Db& db() const { return session->db(); }
  Instrument::Target CallTarget() const { return Instrument::On(param.portId); }

  std::shared_ptr<Api::Session> session;
  HostCtl::Network::DVPortParam param;
  std::string dvs;
};

}  // namespace TarnCtl::Network
