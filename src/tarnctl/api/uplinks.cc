// Links between standard switches and pnics. AddUplink(pnic, true) links in
// both layers, (pnic, false) in the running state only; RemoveUplink(pnic,
// true) unlinks in the stored configuration only, (pnic, false) in both.
#include "hostctl/tarnctl.h"
#include "tarnctl/api/standard_state.h"
#include "tarnctl/instrument/errors.h"
#include "tarnctl/model/names.h"
#include "tarnctl/store/meta.h"

namespace TarnCtl::Network {

using Api::StandardState;
using Instrument::Refused;
using Store::Layer;

void VirtualSwitchImpl::AddUplink(const std::string& pnic, bool flag) {
  StandardState& sw = Api::AsStandard(*state_);
  TARN_CALL_ON(sw, AddUplink, pnic, flag);
  sw.EnsureStillExists();
  Store::Db& db = sw.db();
  Model::CheckFreePnic(db, pnic);
  const int64_t seq = Store::Meta::NextSeq(db);
  Store::Standard::Link(db, Layer::kRunning, pnic, sw.name(), seq);
  if (flag) Store::Standard::Link(db, Layer::kStored, pnic, sw.name(), seq);
}

void VirtualSwitchImpl::RemoveUplink(const std::string& pnic, bool configOnly) {
  StandardState& sw = Api::AsStandard(*state_);
  TARN_CALL_ON(sw, RemoveUplink, pnic, configOnly);
  Store::Db& db = sw.db();
  if (configOnly) {
    if (!Store::Standard::Linked(db, Layer::kStored, pnic, sw.name())) {
      throw Refused(pnic + " is not linked to " + sw.name(), "in the stored configuration");
    }
  } else {
    sw.EnsureStillExists();
    if (!Store::Standard::Linked(db, Layer::kRunning, pnic, sw.name())) {
      throw Refused(pnic + " is not linked to " + sw.name());
    }
  }
  Store::Standard::Unlink(db, pnic, sw.name(), configOnly);
}

void VirtualSwitchImpl::RestoreUplinks() {
  StandardState& sw = Api::AsStandard(*state_);
  TARN_CALL_ON(sw, RestoreUplinks);
  sw.EnsureStillExists();
  Store::Db& db = sw.db();
  const auto missing = Store::Standard::UnrestoredLinks(db, sw.name());
  for (const auto& [pnic, seq] : missing) {
    Model::CheckFreePnic(db, pnic);
    Store::Standard::Link(db, Layer::kRunning, pnic, sw.name(), seq);
  }
}

}  // namespace TarnCtl::Network
