// Makers of the library's switch objects, for the lookups and lists.
#pragma once

#include <memory>
#include <string>

#include "hostctl/network.h"
#include "tarnctl/session.h"
#include "tarnctl/standard_state.h"

namespace TarnCtl::Detail {

std::unique_ptr<HostCtl::Network::VirtualSwitch> MakeVirtualSwitch(std::shared_ptr<Session> session,
                                                                   std::string name,
                                                                   StandardRow row);
// The running distributed switch `name`; nullptr when there is none.
std::unique_ptr<HostCtl::Network::DVSwitch> FindDVSwitch(std::shared_ptr<Session> session,
                                                         const std::string& name);
// The opaque switch `name`; nullptr when there is none.
std::unique_ptr<HostCtl::Network::DVSwitch> FindOpaqueSwitch(std::shared_ptr<Session> session,
                                                             const std::string& name);
// The state of the opaque switch `name` whose portset is `portset`.
std::unique_ptr<Network::PortsetImpl::State> MakeOpaqueState(std::shared_ptr<Session> session,
                                                             const std::string& name,
                                                             const std::string& portset);

}  // namespace TarnCtl::Detail
