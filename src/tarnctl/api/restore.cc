// Restore after a reboot: stored standard switches and port groups, and the
// cached distributed switches with their uplinks, back into the running
// state. Objects that are running already, or whose names or pnics are taken
// by running ones, are left as they are.
#include "hostctl/tarnctl.h"
#include "tarnctl/api/info_state.h"
#include "tarnctl/instrument/call.h"
#include "tarnctl/instrument/errors.h"
#include "tarnctl/store/reset.h"

namespace TarnCtl::Network {

void VirtualSwitchInfoImpl::RestoreVirtualSwitches() {
  Store::Db& db = state_->db();
  TARN_CALL(&db, RestoreVirtualSwitches, Instrument::Nothing());
  Store::Reset::RestoreStandard(db);
}

void VirtualSwitchInfoImpl::RestoreDVSwitches(const std::string& cacheFile) {
  Store::Db& db = state_->db();
  TARN_CALL(&db, RestoreDVSwitches, Instrument::Named(cacheFile), cacheFile);
  if (cacheFile != NetworkInfoImpl::DefaultDVSCacheFile) {
    throw Instrument::Refused("Cannot open distributed switch cache " + cacheFile,
                              "(the cache is " + NetworkInfoImpl::DefaultDVSCacheFile + ")");
  }
  Store::Reset::RestoreDistributed(db);
}

}  // namespace TarnCtl::Network
