// Stored timeout records, added and removed as the host's configuration
// tool would: `orvocfg-vswitch -O` and `-G` load the matching ones.
#include <string>

#include "tarnctl/admin/host.h"
#include "tarnctl/admin/state.h"
#include "tarnctl/instrument/call.h"
#include "tarnctl/instrument/errors.h"
#include "tarnctl/model/limits.h"
#include "tarnctl/model/names.h"
#include "tarnctl/store/timeouts.h"
#include "tarnctl/store/transaction.h"

namespace TarnCtl::Admin {

using Instrument::Refused;
using Instrument::Scope;
using Store::Layer;

namespace {

// A record by its key, as refusals name it.
std::string UplinkRecord(const std::string& portset, const std::string& uplink, uint32_t lagId) {
  return "uplink timeout for " + portset + ", " + uplink + ", LAG " + std::to_string(lagId);
}
std::string LagRecord(const std::string& portset, uint32_t lagId) {
  return "LAG timeout for " + portset + ", LAG " + std::to_string(lagId);
}

}  // namespace

void Host::AddUplinkTimeout(const std::string& portset, const std::string& uplink, uint32_t lagId,
                            uint32_t timeout) {
  Store::Db& db = state_->db();
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

void Host::AddLagTimeout(const std::string& portset, uint32_t lagId, uint32_t timeout) {
  Store::Db& db = state_->db();
  Scope scope(db, "AddLagTimeout");
  Model::CheckName(Model::NameKind::kPortset, portset);
  Model::Check(Model::kTimeout, timeout);
  Store::Transaction transaction(db);
  if (!Store::Timeouts::StoreLag(db, {portset, lagId, static_cast<uint8_t>(timeout)})) {
    throw Refused("A " + LagRecord(portset, lagId) + " is already stored");
  }
  transaction.Commit();
}

void Host::RemoveUplinkTimeout(const std::string& portset, const std::string& uplink,
                               uint32_t lagId) {
  Store::Db& db = state_->db();
  Scope scope(db, "RemoveUplinkTimeout");
  Store::Transaction transaction(db);
  if (!Store::Timeouts::DeleteUplink(db, Layer::kStored, {portset, uplink, lagId, 0})) {
    throw Refused("No " + UplinkRecord(portset, uplink, lagId) + " is stored");
  }
  transaction.Commit();
}

void Host::RemoveLagTimeout(const std::string& portset, uint32_t lagId) {
  Store::Db& db = state_->db();
  Scope scope(db, "RemoveLagTimeout");
  Store::Transaction transaction(db);
  if (!Store::Timeouts::DeleteLag(db, Layer::kStored, {portset, lagId, 0})) {
    throw Refused("No " + LagRecord(portset, lagId) + " is stored");
  }
  transaction.Commit();
}

}  // namespace TarnCtl::Admin
