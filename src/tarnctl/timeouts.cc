// Uplink and LAG timeouts. Layer 0 holds the stored records, layer 1 the
// records loaded into the running state. A filter matches a record when the
// portset is empty or equal, the LAG id is 0 or equal and (uplinks) the
// uplink is empty or equal. A non-empty portset must name a running portset.
#include "hostctl/tarnctl.h"
#include "tarnctl/call.h"
#include "tarnctl/errors.h"
#include "tarnctl/info_state.h"
#include "tarnctl/names.h"

namespace TarnCtl::Network {

using Detail::Call;
using Detail::FormatArgs;
using Detail::Named;
using Detail::Session;
using Detail::Transaction;
namespace HN = HostCtl::Network;

namespace {

void CheckPortset(Session& session, const std::string& portset) {
  if (!portset.empty() && !Detail::FindPortset(session, portset)) {
    throw Detail::Refused("Portset " + portset + " does not exist", "on this host");
  }
}

}  // namespace

void VirtualSwitchInfoImpl::LoadUplinkTimeoutConfig(const std::string& portset, uint32_t lagId,
                                                    const std::string& uplink) {
  Session& session = *state_->session;
  Call call(&session, "LoadUplinkTimeoutConfig", Named(portset),
            FormatArgs(portset, lagId, uplink));
  CheckPortset(session, portset);
  Transaction transaction(session);
  for (const char* sql :
       {"DELETE FROM uplink_timeout WHERE layer = 1 AND (?1 = '' OR portset = ?1)"
        " AND (?2 = 0 OR lag_id = ?2) AND (?3 = '' OR uplink = ?3)",
        "INSERT INTO uplink_timeout(layer, portset, uplink, lag_id, timeout)"
        " SELECT 1, portset, uplink, lag_id, timeout FROM uplink_timeout WHERE layer = 0"
        " AND (?1 = '' OR portset = ?1) AND (?2 = 0 OR lag_id = ?2) AND (?3 = '' OR uplink = "
        "?3)"}) {
    session.Prepare(sql).Bind(1, portset).Bind(2, lagId).Bind(3, uplink).Run();
  }
  transaction.Commit();
}

std::vector<HN::UplinkTimeoutConfig> VirtualSwitchInfoImpl::GetUplinkTimeoutConfig(
    const std::string& portset, uint32_t lagId, const std::string& uplink) {
  Session& session = *state_->session;
  Call call(&session, "GetUplinkTimeoutConfig", Named(portset), FormatArgs(portset, lagId, uplink));
  CheckPortset(session, portset);
  auto select = session.Prepare(
      "SELECT portset, uplink, lag_id, timeout FROM uplink_timeout WHERE layer = 1"
      " AND (?1 = '' OR portset = ?1) AND (?2 = 0 OR lag_id = ?2) AND (?3 = '' OR uplink = ?3)"
      " ORDER BY portset, uplink, lag_id");
  select.Bind(1, portset).Bind(2, lagId).Bind(3, uplink);
  std::vector<HN::UplinkTimeoutConfig> records;
  while (select.Step()) {
    records.push_back({select.Text(0), select.Text(1), static_cast<uint32_t>(select.Int(2)),
                       static_cast<uint8_t>(select.Int(3))});
  }
  return records;
}

void VirtualSwitchInfoImpl::LoadLagTimeoutConfig(const std::string& portset, uint32_t lagId) {
  Session& session = *state_->session;
  Call call(&session, "LoadLagTimeoutConfig", Named(portset), FormatArgs(portset, lagId));
  CheckPortset(session, portset);
  Transaction transaction(session);
  for (const char* sql : {"DELETE FROM lag_timeout WHERE layer = 1 AND (?1 = '' OR portset = ?1)"
                          " AND (?2 = 0 OR lag_id = ?2)",
                          "INSERT INTO lag_timeout(layer, portset, lag_id, timeout)"
                          " SELECT 1, portset, lag_id, timeout FROM lag_timeout WHERE layer = 0"
                          " AND (?1 = '' OR portset = ?1) AND (?2 = 0 OR lag_id = ?2)"}) {
    session.Prepare(sql).Bind(1, portset).Bind(2, lagId).Run();
  }
  transaction.Commit();
}

std::vector<HN::LagTimeoutConfig> VirtualSwitchInfoImpl::GetLagTimeoutConfig(
    const std::string& portset, uint32_t lagId) {
  Session& session = *state_->session;
  Call call(&session, "GetLagTimeoutConfig", Named(portset), FormatArgs(portset, lagId));
  CheckPortset(session, portset);
  auto select = session.Prepare(
      "SELECT portset, lag_id, timeout FROM lag_timeout WHERE layer = 1"
      " AND (?1 = '' OR portset = ?1) AND (?2 = 0 OR lag_id = ?2) ORDER BY portset, lag_id");
  select.Bind(1, portset).Bind(2, lagId);
  std::vector<HN::LagTimeoutConfig> records;
  while (select.Step()) {
    records.push_back({select.Text(0), static_cast<uint32_t>(select.Int(1)),
                       static_cast<uint8_t>(select.Int(2))});
  }
  return records;
}

}  // namespace TarnCtl::Network
