// ENS on a portset. Activation needs the host-wide ENS node to have been set
// since boot (NODI_Set); a portset with ENS active has a row in `ens`;
// reassociations are recorded as events. Opaque portsets refuse every
// change.
#include "tarnctl/store/ens.h"
#include "hostctl/tarnctl.h"
#include "tarnctl/api/portset_state.h"
#include "tarnctl/instrument/errors.h"
#include "tarnctl/store/meta.h"

namespace TarnCtl::Network {

using Instrument::Refused;

bool PortsetImpl::GetEnsMode() {
  TARN_CALL_ON(*state_, GetEnsMode);
  return Store::Ens::IsActive(state_->db(), state_->EnsName(false));
}

void PortsetImpl::ActivateEns(bool intr, bool fastSwitch) {
  TARN_CALL_ON(*state_, ActivateEns, intr, fastSwitch);
  const std::string portset = state_->EnsName(true);
  Store::Db& db = state_->db();
  if (!Store::Meta::EnsNodeSet(db)) {
    throw Refused("ENS is not enabled on this host", "(its activation node is not set)");
  }
  Store::Ens::Activate(db, {portset, intr, fastSwitch});
}

void PortsetImpl::DeactivateEns() {
  TARN_CALL_ON(*state_, DeactivateEns);
  const std::string portset = state_->EnsName(true);
  Store::Db& db = state_->db();
  if (!Store::Ens::IsActive(db, portset)) throw Refused("ENS is not active on " + portset);
  Store::Ens::Deactivate(db, portset);
}

void PortsetImpl::ReassociateEnsUplinks(bool mode, bool force, int reserved1, int reserved2) {
  TARN_CALL_ON(*state_, ReassociateEnsUplinks, mode, force, reserved1, reserved2);
  const std::string portset = state_->EnsName(true);
  Store::Db& db = state_->db();
  Store::Ens::AddReassociation(db, portset, mode, force, Store::Meta::NextSeq(db));
}

}  // namespace TarnCtl::Network
