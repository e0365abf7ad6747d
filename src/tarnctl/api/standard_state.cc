#include "tarnctl/api/standard_state.h"

#include "tarnctl/instrument/errors.h"

namespace TarnCtl::Api {

using Store::Layer;

StandardState::StandardState(std::shared_ptr<Session> session, std::string name)
    : State(std::move(session)), name_(std::move(name)) {}

StandardState::StandardState(std::shared_ptr<Session> session, std::string name,
                             Store::Standard::Row row)
    : State(std::move(session)), name_(std::move(name)), row_(db(), std::move(row)) {}

void NoSuchStandardSwitch(const std::string& name) {
  throw Instrument::Refused("Virtual switch " + name + " does not exist", "on this host");
}

const Store::Standard::Row& StandardState::Row() {
  return row_.Get(db(), [this] {
    auto row = Store::Standard::Find(db(), Layer::kRunning, name_);
    if (!row) NoSuchStandardSwitch(name_);
    return *std::move(row);
  });
}

uint32_t StandardState::UsedPorts() {
  EnsureStillExists();
  return static_cast<uint32_t>(Store::Standard::UsedPorts(db(), name_));
}

std::vector<std::string> StandardState::Uplinks() {
  EnsureStillExists();
  return Store::Standard::Uplinks(db(), Layer::kRunning, name_);
}

std::string StandardState::EnsName(bool) {
  EnsureStillExists();
  return name_;
}

}  // namespace TarnCtl::Api
