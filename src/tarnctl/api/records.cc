// Member functions of the records. They trace and check faults against the
// process's open session only; with none open they open none.
#include "hostctl/records.h"

#include "tarnctl/api/session.h"
#include "tarnctl/instrument/call.h"
#include "tarnctl/model/limits.h"
#include "tarnctl/model/teaming.h"

namespace HostCtl::Network {

using TarnCtl::Instrument::Of;

namespace {

TarnCtl::Store::Db* OpenDb() {
  const auto session = TarnCtl::Api::Session::Current();
  return session ? &session->db() : nullptr;
}

}  // namespace

NicTeamingPolicy NicTeamingPolicy::GetDefaultPolicy() {
  TARN_CALL(OpenDb(), GetDefaultPolicy, Of("NicTeamingPolicy"));
  return TarnCtl::Model::DefaultTeamingPolicy();
}

NicCapabilities NicCapabilities::GetDefaultPolicy() {
  TARN_CALL(OpenDb(), GetDefaultPolicy, Of("NicCapabilities"));
  return {};
}

ShapingPolicy ShapingPolicy::GetDefaultPolicy() {
  TARN_CALL(OpenDb(), GetDefaultPolicy, Of("ShapingPolicy"));
  return {};
}

PortSecurityPolicy PortSecurityPolicy::GetDefaultPolicy() {
  TARN_CALL(OpenDb(), GetDefaultPolicy, Of("PortSecurityPolicy"));
  return {};
}

void NicTeamingPolicy::SetMaxActiveUplinks(int count) {
  TARN_CALL(OpenDb(), SetMaxActiveUplinks, TarnCtl::Instrument::Nothing(), count);
  TarnCtl::Model::Check(TarnCtl::Model::kMaxActive, count);
  maxActive = count;
}

void NicTeamingPolicy::SetUplinkOrder(std::vector<std::string> order) {
  TARN_CALL(OpenDb(), SetUplinkOrder, TarnCtl::Instrument::Nothing(), order);
  uplinkOrder = std::move(order);
  flags |= kUplinkOrderSet;
}

}  // namespace HostCtl::Network
