// What a portset object holds: the session, and the behaviour of its kind
// (standard, distributed or opaque switch) behind one interface.
#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "hostctl/tarnctl.h"
#include "tarnctl/api/session.h"
#include "tarnctl/instrument/call.h"

namespace TarnCtl::Network {

struct PortsetImpl::State {
  explicit State(std::shared_ptr<Api::Session> s) : session(std::move(s)) {}
  virtual ~State() = default;

  Store::Db& db() { return session->db(); }

  std::shared_ptr<Api::Session> session;

  // How calls on the object are traced and matched by faults.
  virtual Instrument::Target CallTarget() const = 0;
  virtual std::string Name() = 0;
  virtual uint32_t NumPorts() = 0;
  virtual uint32_t ConfiguredPorts() = 0;
  virtual uint32_t UsedPorts() = 0;
  virtual std::vector<std::string> Uplinks() = 0;
  // The portset name ENS records use, after checking that the portset still
  // exists; refuses when `change` and ENS cannot be changed on it.
  virtual std::string EnsName(bool change) = 0;
};

}  // namespace TarnCtl::Network
