// Links between standard switches and pnics. AddUplink(pnic, true) links in
// both layers, (pnic, false) in the running state only; RemoveUplink(pnic,
// true) unlinks in the stored configuration only, (pnic, false) in both.
#include "hostctl/tarnctl.h"
#include "tarnctl/call.h"
#include "tarnctl/errors.h"
#include "tarnctl/names.h"
#include "tarnctl/standard_state.h"

namespace TarnCtl::Network {

using Detail::Call;
using Detail::FormatArgs;
using Detail::Refused;
using Detail::Session;
using Detail::StandardState;
using Detail::Transaction;

namespace {

bool Linked(Session& session, int64_t layer, const std::string& pnic, const std::string& sw) {
  return session.Prepare("SELECT 1 FROM link WHERE layer = ? AND pnic = ? AND switch = ?")
      .Bind(1, layer)
      .Bind(2, pnic)
      .Bind(3, sw)
      .Step();
}

void Link(Session& session, int64_t layer, const std::string& pnic, const std::string& sw,
          int64_t seq) {
  session.Prepare("INSERT OR REPLACE INTO link(layer, pnic, switch, seq) VALUES (?, ?, ?, ?)")
      .Bind(1, layer)
      .Bind(2, pnic)
      .Bind(3, sw)
      .Bind(4, seq)
      .Run();
}

}  // namespace

void VirtualSwitchImpl::AddUplink(const std::string& pnic, bool flag) {
  StandardState& sw = Detail::AsStandard(*state_);
  Call call(sw.session.get(), "AddUplink", sw.CallTarget(), FormatArgs(pnic, flag));
  sw.Row();
  Session& session = *sw.session;
  Detail::CheckFreePnic(session, pnic);
  Transaction transaction(session);
  const int64_t seq = session.NextSeq();
  Link(session, 1, pnic, sw.name(), seq);
  if (flag) Link(session, 0, pnic, sw.name(), seq);
  transaction.Commit();
}

void VirtualSwitchImpl::RemoveUplink(const std::string& pnic, bool configOnly) {
  StandardState& sw = Detail::AsStandard(*state_);
  Call call(sw.session.get(), "RemoveUplink", sw.CallTarget(), FormatArgs(pnic, configOnly));
  Session& session = *sw.session;
  if (configOnly) {
    if (!Linked(session, 0, pnic, sw.name())) {
      throw Refused(pnic + " is not linked to " + sw.name(), "in the stored configuration");
    }
  } else {
    sw.Row();
    if (!Linked(session, 1, pnic, sw.name()))
      throw Refused(pnic + " is not linked to " + sw.name());
  }
  Transaction transaction(session);
  session.Prepare("DELETE FROM link WHERE pnic = ? AND switch = ? AND (layer = 0 OR ? = 0)")
      .Bind(1, pnic)
      .Bind(2, sw.name())
      .Bind(3, configOnly ? 1 : 0)
      .Run();
  transaction.Commit();
}

void VirtualSwitchImpl::RestoreUplinks() {
  StandardState& sw = Detail::AsStandard(*state_);
  Call call(sw.session.get(), "RestoreUplinks", sw.CallTarget(), "");
  sw.Row();
  Session& session = *sw.session;
  struct Missing {
    std::string pnic;
    int64_t seq;
  };
  std::vector<Missing> missing;
  {
    auto select = session.Prepare(
        "SELECT s.pnic, s.seq FROM link s WHERE s.layer = 0 AND s.switch = ?1 AND NOT EXISTS"
        " (SELECT 1 FROM link r WHERE r.layer = 1 AND r.pnic = s.pnic AND r.switch = ?1)"
        " ORDER BY s.seq");
    select.Bind(1, sw.name());
    while (select.Step()) missing.push_back({select.Text(0), select.Int(1)});
  }
  Transaction transaction(session);
  for (const Missing& link : missing) {
    Detail::CheckFreePnic(session, link.pnic);
    Link(session, 1, link.pnic, sw.name(), link.seq);
  }
  transaction.Commit();
}

}  // namespace TarnCtl::Network
