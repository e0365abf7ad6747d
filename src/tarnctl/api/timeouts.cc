// Uplink and LAG timeouts (store/timeouts.h). A non-empty portset in a
// filter must name a running portset.
#include "tarnctl/store/timeouts.h"
#include "hostctl/tarnctl.h"
#include "tarnctl/api/info_state.h"
#include "tarnctl/instrument/call.h"
#include "tarnctl/instrument/errors.h"
#include "tarnctl/model/names.h"

namespace TarnCtl::Network {

using Instrument::Named;
using Store::Layer;
namespace HN = HostCtl::Network;

namespace {

void CheckPortset(Store::Db& db, const std::string& portset) {
  if (!portset.empty() && !Model::FindPortset(db, portset)) {
    throw Instrument::Refused("Portset " + portset + " does not exist", "on this host");
  }
}

}  // namespace

void VirtualSwitchInfoImpl::LoadUplinkTimeoutConfig(const std::string& portset, uint32_t lagId,
                                                    const std::string& uplink) {
  Store::Db& db = state_->db();
  TARN_CALL(&db, LoadUplinkTimeoutConfig, Named(portset), portset, lagId, uplink);
  CheckPortset(db, portset);
  Store::Timeouts::LoadUplinks(db, {portset, uplink, lagId, 0});
}

std::vector<HN::UplinkTimeoutConfig> VirtualSwitchInfoImpl::GetUplinkTimeoutConfig(
    const std::string& portset, uint32_t lagId, const std::string& uplink) {
  Store::Db& db = state_->db();
  TARN_CALL(&db, GetUplinkTimeoutConfig, Named(portset), portset, lagId, uplink);
  CheckPortset(db, portset);
  return Store::Timeouts::Uplinks(db, Layer::kRunning, {portset, uplink, lagId, 0});
}

void VirtualSwitchInfoImpl::LoadLagTimeoutConfig(const std::string& portset, uint32_t lagId) {
  Store::Db& db = state_->db();
  TARN_CALL(&db, LoadLagTimeoutConfig, Named(portset), portset, lagId);
  CheckPortset(db, portset);
  Store::Timeouts::LoadLags(db, {portset, lagId, 0});
}

std::vector<HN::LagTimeoutConfig> VirtualSwitchInfoImpl::GetLagTimeoutConfig(
    const std::string& portset, uint32_t lagId) {
  Store::Db& db = state_->db();
  TARN_CALL(&db, GetLagTimeoutConfig, Named(portset), portset, lagId);
  CheckPortset(db, portset);
  return Store::Timeouts::Lags(db, Layer::kRunning, {portset, lagId, 0});
}

}  // namespace TarnCtl::Network
