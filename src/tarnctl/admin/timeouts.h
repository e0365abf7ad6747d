// Timeout records of uplinks and LAGs: stored ones added and removed as the
// host's configuration tool would (`orvocfg-vswitch -O` and `-G` load the
// matching ones); one reading of a layer, printed as text, JSON and rows.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "tarnctl/admin/view.h"
#include "tarnctl/store/layer.h"
#include "tarnctl/store/timeouts.h"

namespace TarnCtl::Admin {

struct Timeouts {
  std::vector<Store::Timeouts::Uplink> uplinks;
  std::vector<Store::Timeouts::Lag> lags;
};

Timeouts TimeoutsOf(Store::Db& db, Store::Layer layer);

void AddUplinkTimeout(Store::Db& db, const std::string& portset, const std::string& uplink,
                      uint32_t lagId, uint32_t timeout);
void AddLagTimeout(Store::Db& db, const std::string& portset, uint32_t lagId, uint32_t timeout);
void RemoveUplinkTimeout(Store::Db& db, const std::string& portset, const std::string& uplink,
                         uint32_t lagId);
void RemoveLagTimeout(Store::Db& db, const std::string& portset, uint32_t lagId);

// Stored records: "uplink" or "lag", portset, uplink, LAG id, timeout.
std::vector<ListRow> ListTimeouts(Store::Db& db);

// Two lines of `tarnhost show`: uplink timeouts, LAG timeouts.
std::string TimeoutsText(const Timeouts& timeouts);
// Adds "uplinkTimeouts" and "lagTimeouts" to `into`.
void AddTimeoutsJson(const Timeouts& timeouts, Json& into);

}  // namespace TarnCtl::Admin
