// Member functions of the records. They trace and check faults against the
// process's open session only; with none open they open none.
#include "hostctl/records.h"

#include <algorithm>

#include "tarnctl/call.h"
#include "tarnctl/errors.h"
#include "tarnctl/session.h"

namespace HostCtl::Network {

using TarnCtl::Detail::Call;
using TarnCtl::Detail::FormatArgs;
using TarnCtl::Detail::Session;

namespace {

template <typename Record>
Record DefaultOf(const char* record) {
  const auto session = Session::Current();
  Call call(session.get(), "GetDefaultPolicy", TarnCtl::Detail::Of(record), "");
  return Record{};
}

}  // namespace

NicTeamingPolicy NicTeamingPolicy::GetDefaultPolicy() {
  NicTeamingPolicy policy = DefaultOf<NicTeamingPolicy>("NicTeamingPolicy");
  policy.flags = kUplinkOrderSet;
  return policy;
}

NicCapabilities NicCapabilities::GetDefaultPolicy() {
  return DefaultOf<NicCapabilities>("NicCapabilities");
}

ShapingPolicy ShapingPolicy::GetDefaultPolicy() {
  return DefaultOf<ShapingPolicy>("ShapingPolicy");
}

PortSecurityPolicy PortSecurityPolicy::GetDefaultPolicy() {
  return DefaultOf<PortSecurityPolicy>("PortSecurityPolicy");
}

void NicTeamingPolicy::SetMaxActiveUplinks(int count) {
  const auto session = Session::Current();
  Call call(session.get(), "SetMaxActiveUplinks", TarnCtl::Detail::Nothing(), FormatArgs(count));
  if (count < 0) {
    throw TarnCtl::Detail::Refusal("SetMaxActiveUplinks",
                                   "Invalid max active uplinks " + std::to_string(count),
                                   "(it must be 0 or more)");
  }
  maxActive = count;
}

void NicTeamingPolicy::SetUplinkOrder(std::vector<std::string> order) {
  const auto session = Session::Current();
  Call call(session.get(), "SetUplinkOrder", TarnCtl::Detail::Nothing(), FormatArgs(order));
  uplinkOrder = std::move(order);
  flags |= kUplinkOrderSet;
}

}  // namespace HostCtl::Network
