// Creation of standard switches (in both layers) and distributed switches
// (in the running state and the cache).
#include "tarnctl/api/create.h"

#include "hostctl/tarnctl.h"
#include "tarnctl/api/info_state.h"
#include "tarnctl/api/switches.h"
#include "tarnctl/instrument/call.h"
#include "tarnctl/instrument/errors.h"
#include "tarnctl/model/limits.h"
#include "tarnctl/model/names.h"
#include "tarnctl/model/teaming.h"
#include "tarnctl/model/words.h"
#include "tarnctl/store/meta.h"
#include "tarnctl/store/policy_codec.h"
#include "tarnctl/store/transaction.h"

namespace TarnCtl::Api {

using Store::Layer;

Store::Standard::Row CreateStandardSwitch(Store::Db& db, const std::string& name, int64_t ports,
                                          const HostCtl::Network::NicTeamingPolicy& teaming,
                                          bool system) {
  Model::CheckNewSwitchName(db, Model::NameKind::kSwitch, name);
  Model::Check(Model::kPorts, ports);
  Model::CheckTeamingPolicy(teaming);
  const Store::Standard::Row row{static_cast<uint32_t>(ports), Model::kDefaultMtu,
                                 Model::kDefaultCdpStatus, system,
                                 Store::EncodeTeamingPolicy(teaming)};
  // Administration makes this change outside any operation's savepoint:
  // it is made whole here.
  Store::Transaction transaction(db);
  Store::Standard::DeleteStored(db, name);
  const int64_t seq = Store::Meta::NextSeq(db);
  for (Layer layer : Store::kBothLayers) Store::Standard::Insert(db, layer, name, seq, row);
  transaction.Commit();
  return row;
}

void CreateDVSwitch(Store::Db& db, const NewDVSwitch& dvs) {
  Model::CheckUuid(dvs.uuid);
  Model::CheckImplClass(dvs.implClass);
  Model::Check(Model::kDvsVersion, dvs.version);
  Model::CheckNewSwitchName(db, Model::NameKind::kSwitch, dvs.name);
  if (dvs.portset != dvs.name)
    Model::CheckNewSwitchName(db, Model::NameKind::kPortset, dvs.portset);
  Model::Check(Model::kPorts, dvs.ports);
  Model::Check(Model::kMtu, dvs.mtu);
  Model::CheckName(Model::NameKind::kSwitchId, dvs.switchId);
  if (Store::Distributed::NameOfSwitchId(db, Layer::kRunning, dvs.switchId)) {
    throw Instrument::Refused("A DVS with id " + dvs.switchId + " already exists", "on this host");
  }
  const Store::Distributed::Row row{dvs.portset,
                                    dvs.switchId,
                                    dvs.uuid,
                                    dvs.implClass,
                                    static_cast<int32_t>(dvs.version),
                                    static_cast<uint32_t>(dvs.ports),
                                    static_cast<uint32_t>(dvs.mtu)};
  // Administration makes this change outside any operation's savepoint:
  // it is made whole here.
  Store::Transaction transaction(db);
  Store::Distributed::DeleteCachedClashes(db, dvs.name, dvs.portset, dvs.switchId);
  const int64_t seq = Store::Meta::NextSeq(db);
  for (Layer layer : Store::kBothLayers) Store::Distributed::Insert(db, layer, dvs.name, seq, row);
  transaction.Commit();
}

}  // namespace TarnCtl::Api

namespace TarnCtl::Network {

std::unique_ptr<HostCtl::Network::DVSwitch> VirtualSwitchInfoImpl::AddDVSwitch(
    const std::string& uuid, const std::string& switchName, const std::string& implClass,
    const std::string& portsetName, int32_t numPorts, int32_t version, int reserved) {
  Store::Db& db = state_->db();
  TARN_CALL(&db, AddDVSwitch, Instrument::Named(switchName), uuid, switchName, implClass,
            portsetName, numPorts, version, reserved);
  // The UUID names the switch in DVPort keys: it is its switch id too.
  Api::CreateDVSwitch(
      db, {switchName, portsetName, uuid, uuid, implClass, version, numPorts, Model::kDefaultMtu});
  return Api::FindDVSwitch(state_->session, switchName);
}

}  // namespace TarnCtl::Network
