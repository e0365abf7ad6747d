// ENS on a portset. Activation needs the host-wide ENS node to have been set
// since boot (NODI_Set, meta 'ens_node'); a portset with ENS active has a
// row in `ens`; reassociations are recorded as events. Opaque portsets
// refuse every change.
#include "hostctl/tarnctl.h"
#include "tarnctl/call.h"
#include "tarnctl/errors.h"
#include "tarnctl/portset_state.h"

namespace TarnCtl::Network {

using Detail::Call;
using Detail::FormatArgs;
using Detail::Refused;
using Detail::Session;
using Detail::Transaction;

namespace {

bool EnsActive(Session& session, const std::string& portset) {
  return session.Prepare("SELECT 1 FROM ens WHERE portset = ?").Bind(1, portset).Step();
}

}  // namespace

bool PortsetImpl::GetEnsMode() {
  Call call(state_->session.get(), "GetEnsMode", state_->CallTarget(), "");
  return EnsActive(*state_->session, state_->EnsName(false));
}

void PortsetImpl::ActivateEns(bool intr, bool fastSwitch) {
  Call call(state_->session.get(), "ActivateEns", state_->CallTarget(),
            FormatArgs(intr, fastSwitch));
  const std::string portset = state_->EnsName(true);
  Session& session = *state_->session;
  auto node = session.Prepare("SELECT value FROM meta WHERE key = 'ens_node'");
  if (!node.Step() || node.Text(0) != "1") {
    throw Refused("ENS is not enabled on this host", "(its activation node is not set)");
  }
  Transaction transaction(session);
  session.Prepare("INSERT OR REPLACE INTO ens(portset, intr, fast_switch) VALUES (?, ?, ?)")
      .Bind(1, portset)
      .Bind(2, intr ? 1 : 0)
      .Bind(3, fastSwitch ? 1 : 0)
      .Run();
  transaction.Commit();
}

void PortsetImpl::DeactivateEns() {
  Call call(state_->session.get(), "DeactivateEns", state_->CallTarget(), "");
  const std::string portset = state_->EnsName(true);
  Session& session = *state_->session;
  if (!EnsActive(session, portset)) throw Refused("ENS is not active on " + portset);
  Transaction transaction(session);
  session.Prepare("DELETE FROM ens WHERE portset = ?").Bind(1, portset).Run();
  transaction.Commit();
}

void PortsetImpl::ReassociateEnsUplinks(bool mode, bool force, int reserved1, int reserved2) {
  Call call(state_->session.get(), "ReassociateEnsUplinks", state_->CallTarget(),
            FormatArgs(mode, force, reserved1, reserved2));
  const std::string portset = state_->EnsName(true);
  Session& session = *state_->session;
  Transaction transaction(session);
  session.Prepare("INSERT INTO ens_event(seq, portset, mode, force) VALUES (?, ?, ?, ?)")
      .Bind(1, session.NextSeq())
      .Bind(2, portset)
      .Bind(3, mode ? 1 : 0)
      .Bind(4, force ? 1 : 0)
      .Run();
  transaction.Commit();
}

}  // namespace TarnCtl::Network
