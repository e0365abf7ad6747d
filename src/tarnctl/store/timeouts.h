// Uplink and LAG timeout records (tables uplink_timeout, lag_timeout): the
// stored records in the stored layer, the ones loaded into the running
// state in the running layer.
//
// A filter matches a record when its portset is empty or equal, its LAG id
// is 0 or equal and (uplinks) its uplink is empty or equal.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "hostctl/records.h"
#include "tarnctl/store/layer.h"

namespace TarnCtl::Store {
class Db;
}

namespace TarnCtl::Store::Timeouts {

using Uplink = HostCtl::Network::UplinkTimeoutConfig;
using Lag = HostCtl::Network::LagTimeoutConfig;

// Replaces the running records that match with the stored ones that match.
void LoadUplinks(Db& db, const Uplink& filter);
void LoadLags(Db& db, const Lag& filter);
// The records of `layer` that match, by portset, uplink and LAG id.
std::vector<Uplink> Uplinks(Db& db, Layer layer, const Uplink& filter);
std::vector<Lag> Lags(Db& db, Layer layer, const Lag& filter);

// Stores one record; false when a record with its key is stored already.
bool StoreUplink(Db& db, const Uplink& record);
bool StoreLag(Db& db, const Lag& record);
// Drops the records of `layer` with exactly that key; false when none was.
bool DeleteUplink(Db& db, Layer layer, const Uplink& key);
bool DeleteLag(Db& db, Layer layer, const Lag& key);

}  // namespace TarnCtl::Store::Timeouts
