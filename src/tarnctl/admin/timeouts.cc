#include "tarnctl/admin/timeouts.h"

#include "tarnctl/instrument/call.h"
#include "tarnctl/instrument/errors.h"
#include "tarnctl/model/limits.h"
#include "tarnctl/model/names.h"
#include "tarnctl/store/transaction.h"

namespace TarnCtl::Admin {
namespace {

using Instrument::Refused;
using Instrument::Scope;
using Store::Layer;

// A record by its key, as refusals name it.
std::string UplinkRecord(const std::string& portset, const std::string& uplink, uint32_t lagId) {
  return "uplink timeout for " + portset + ", " + uplink + ", LAG " + std::to_string(lagId);
}
std::string LagRecord(const std::string& portset, uint32_t lagId) {
  return "LAG timeout for " + portset + ", LAG " + std::to_string(lagId);
}

}  // namespace

Timeouts TimeoutsOf(Store::Db& db, Layer layer) {
  return {Store::Timeouts::Uplinks(db, layer, {}), Store::Timeouts::Lags(db, layer, {})};
}

void AddUplinkTimeout(Store::Db& db, const std::string& portset, const std::string& uplink,
                      uint32_t lagId, uint32_t timeout) {
  Scope scope(db, "AddUplinkTimeout");
  Model::CheckName(Model::NameKind::kPortset, portset);
  Model::CheckName(Model::NameKind::kUplink, uplink);
  Model::Check(Model::kTimeout, timeout);
  Store::Transaction transaction(db);
  if (!Store::Timeouts::StoreUplink(db, {portset, uplink, lagId, static_cast<uint8_t>(timeout)})) {
    throw Refused("An " + UplinkRecord(portset, uplink, lagId) + " is already stored");
  }
  transaction.Commit();
}

void AddLagTimeout(Store::Db& db, const std::string& portset, uint32_t lagId, uint32_t timeout) {
  Scope scope(db, "AddLagTimeout");
  Model::CheckName(Model::NameKind::kPortset, portset);
  Model::Check(Model::kTimeout, timeout);
  Store::Transaction transaction(db);
  if (!Store::Timeouts::StoreLag(db, {portset, lagId, static_cast<uint8_t>(timeout)})) {
    throw Refused("A " + LagRecord(portset, lagId) + " is already stored");
  }
  transaction.Commit();
}

void RemoveUplinkTimeout(Store::Db& db, const std::string& portset, const std::string& uplink,
                         uint32_t lagId) {
  Scope scope(db, "RemoveUplinkTimeout");
  Store::Transaction transaction(db);
  if (!Store::Timeouts::DeleteUplink(db, Layer::kStored, {portset, uplink, lagId, 0})) {
    throw Refused("No " + UplinkRecord(portset, uplink, lagId) + " is stored");
  }
  transaction.Commit();
}

void RemoveLagTimeout(Store::Db& db, const std::string& portset, uint32_t lagId) {
  Scope scope(db, "RemoveLagTimeout");
  Store::Transaction transaction(db);
  if (!Store::Timeouts::DeleteLag(db, Layer::kStored, {portset, lagId, 0})) {
    throw Refused("No " + LagRecord(portset, lagId) + " is stored");
  }
  transaction.Commit();
}

std::vector<ListRow> ListTimeouts(Store::Db& db) {
  const Timeouts stored = TimeoutsOf(db, Layer::kStored);
  std::vector<ListRow> rows;
  for (const auto& r : stored.uplinks) {
    rows.push_back({"uplink", r.portsetName, r.uplinkName, std::to_string(r.lagId),
                    std::to_string(r.timeout)});
  }
  for (const auto& r : stored.lags) {
    rows.push_back({"lag", r.portsetName, "", std::to_string(r.lagId), std::to_string(r.timeout)});
  }
  return rows;
}

std::string TimeoutsText(const Timeouts& timeouts) {
  std::vector<std::string> uplinks, lags;
  for (const auto& r : timeouts.uplinks) {
    uplinks.push_back(r.portsetName + " " + r.uplinkName + " LAG " + std::to_string(r.lagId) +
                      ": " + std::to_string(r.timeout));
  }
  for (const auto& r : timeouts.lags) {
    lags.push_back(r.portsetName + " LAG " + std::to_string(r.lagId) + ": " +
                   std::to_string(r.timeout));
  }
  return "  Uplink timeouts: " + Listed(uplinks) + "\n  LAG timeouts: " + Listed(lags) + "\n";
}

void AddTimeoutsJson(const Timeouts& timeouts, Json& into) {
  Json uplinks = Json::array(), lags = Json::array();
  for (const auto& r : timeouts.uplinks) {
    uplinks.push_back({{"portset", r.portsetName},
                       {"uplink", r.uplinkName},
                       {"lagId", r.lagId},
                       {"timeout", r.timeout}});
  }
  for (const auto& r : timeouts.lags) {
    lags.push_back({{"portset", r.portsetName}, {"lagId", r.lagId}, {"timeout", r.timeout}});
  }
  into["uplinkTimeouts"] = std::move(uplinks);
  into["lagTimeouts"] = std::move(lags);
}

}  // namespace TarnCtl::Admin
