// DVPorts of distributed switches, by key. A key whose switch id or port id
// names nothing makes an object all the same; IsValid tells, and every
// other operation on it refuses.
#include "hostctl/tarnctl.h"
#include "tarnctl/api/dvport_state.h"
#include "tarnctl/instrument/errors.h"
#include "tarnctl/store/distributed.h"
#include "tarnctl/store/dvports.h"
#include "tarnctl/store/meta.h"

namespace TarnCtl::Network {

using HostCtl::Network::DVPortParam;

namespace {

// The port's connection id; nothing when the key names no port.
std::optional<uint32_t> Connection(const DVPortImpl::State& state) {
  if (state.dvs.empty()) return std::nullopt;
  return Store::DVPorts::ConnectionId(state.db(), state.dvs, state.param.portId);
}

uint32_t CheckValid(const DVPortImpl::State& state) {
  const auto connection = Connection(state);
  if (!connection) {
    throw Instrument::Refused("DVPort " + state.param.portId + " does not exist",
                              "(switch id " + state.param.switchId + ")");
  }
  return *connection;
}

}  // namespace

DVPortImpl::DVPortImpl(const DVPortParam& param)
    : state_(std::make_unique<State>(State{Api::Session::Acquire(), param, ""})) {
  Store::Db& db = state_->db();
  TARN_CALL(&db, DVPortImpl, Instrument::Named(param.portId), param);
  state_->dvs =
      Store::Distributed::NameOfSwitchId(db, Store::Layer::kRunning, param.switchId).value_or("");
  if (const auto connection = Connection(*state_)) state_->param.connectionId = *connection;
}

DVPortImpl::DVPortImpl(std::unique_ptr<State> state) : state_(std::move(state)) {}

DVPortImpl::~DVPortImpl() = default;

bool DVPortImpl::IsValid() {
  TARN_CALL_ON(*state_, IsValid);
  return Connection(*state_).has_value();
}

uint32_t DVPortImpl::GetConnectionId() const {
  TARN_CALL_ON(*state_, GetConnectionId);
  return CheckValid(*state_);
}

void DVPortImpl::SetConnectionId(uint32_t connectionId) {
  TARN_CALL_ON(*state_, SetConnectionId, connectionId);
  CheckValid(*state_);
  Store::DVPorts::SetConnectionId(state_->db(), state_->dvs, state_->param.portId, connectionId);
  state_->param.connectionId = connectionId;
}

int DVPortImpl::TestDVPortNota() {
  TARN_CALL_ON(*state_, TestDVPortNota);
  CheckValid(*state_);
  Store::Db& db = state_->db();
  Store::DVPorts::AddEvent(db, state_->dvs, state_->param.portId, "nota", Store::Meta::NextSeq(db));
  return 0;
}

std::string DVPortImpl::GetPortId() {
  TARN_CALL_ON(*state_, GetPortId);
  return state_->param.portId;
}

bool DVPortImpl::IsInUse(std::vector<std::string>& clients) {
  TARN_CALL_ON(*state_, IsInUse, Instrument::Out{});
  CheckValid(*state_);
  clients = Store::DVPorts::Clients(state_->db(), state_->dvs, state_->param.portId);
  return !clients.empty();
}

const DVPortParam& DVPortImpl::GetParam() const {
  TARN_CALL_ON(*state_, GetParam);
  return state_->param;
}

}  // namespace TarnCtl::Network
