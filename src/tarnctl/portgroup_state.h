// What a port group object holds: the session, its name and a snapshot of
// its running row.
#pragma once

#include <memory>
#include <string>

#include "hostctl/tarnctl.h"
#include "tarnctl/snapshot.h"

namespace TarnCtl::Network {

struct PortGroupRow {
  std::string switchName;
  uint16_t vlan = 0;
  std::string policy;  // policy_codec.h
};

struct PortGroupImpl::State {
  State(std::shared_ptr<Detail::Session> s, std::string n)
      : session(std::move(s)), name(std::move(n)) {}
  State(std::shared_ptr<Detail::Session> s, std::string n, PortGroupRow row)
      : session(std::move(s)), name(std::move(n)), row(*session, std::move(row)) {}

  // The running row; refuses when the port group no longer exists.
  const PortGroupRow& Row();

  std::shared_ptr<Detail::Session> session;
  std::string name;
  Detail::Snapshot<PortGroupRow> row;
};

}  // namespace TarnCtl::Network
