// Makers of the library's switch objects, for the lookups and lists.
#pragma once

#include <memory>
#include <string>

#include "hostctl/network.h"
#include "tarnctl/api/session.h"
#include "tarnctl/store/standard.h"

namespace TarnCtl::Api {

std::unique_ptr<HostCtl::Network::VirtualSwitch> MakeVirtualSwitch(std::shared_ptr<Session> session,
                                                                   std::string name,
                                                                   Store::Standard::Row row);
// The running distributed switch `name`; nullptr when there is none.
std::unique_ptr<HostCtl::Network::DVSwitch> FindDVSwitch(std::shared_ptr<Session> session,
                                                         const std::string& name);
// The opaque switch `name` whose portset is `portset`.
std::unique_ptr<HostCtl::Network::DVSwitch> MakeOpaqueSwitch(std::shared_ptr<Session> session,
                                                             const std::string& name,
                                                             const std::string& portset);

}  // namespace TarnCtl::Api
