// DVPorts of distributed switches, by key. A key whose switch id or port id
// names nothing makes an object all the same; IsValid tells, and every
// other operation on it refuses.
#include "hostctl/tarnctl.h"
#include "tarnctl/call.h"
#include "tarnctl/dvport_state.h"
#include "tarnctl/errors.h"

namespace TarnCtl::Network {

using Detail::Call;
using Detail::FormatArgs;
using Detail::On;
using Detail::Session;
using Detail::Transaction;
using HostCtl::Network::DVPortParam;

namespace {

bool PortExists(const DVPortImpl::State& state) {
  return !state.dvs.empty() &&
         state.session->Prepare("SELECT 1 FROM dvport WHERE dvs = ? AND port_id = ?")
             .Bind(1, state.dvs)
             .Bind(2, state.param.portId)
             .Step();
}

void CheckValid(const DVPortImpl::State& state) {
  if (!PortExists(state)) {
    throw Detail::Refused("DVPort " + state.param.portId + " does not exist",
                          "(switch id " + state.param.switchId + ")");
  }
}

}  // namespace

DVPortImpl::DVPortImpl(const DVPortParam& param)
    : state_(std::make_unique<State>(State{Session::Acquire(), param, ""})) {
  Session& session = *state_->session;
  Call call(&session, "DVPortImpl", Detail::Named(param.portId), FormatArgs(param));
  auto dvs = session.Prepare("SELECT name FROM dvswitch WHERE layer = 1 AND switch_id = ?");
  if (dvs.Bind(1, param.switchId).Step()) state_->dvs = dvs.Text(0);
  auto port = session.Prepare("SELECT connection_id FROM dvport WHERE dvs = ? AND port_id = ?");
  if (port.Bind(1, state_->dvs).Bind(2, param.portId).Step()) {
    state_->param.connectionId = static_cast<uint32_t>(port.Int(0));
  }
}

DVPortImpl::DVPortImpl(std::unique_ptr<State> state) : state_(std::move(state)) {}

DVPortImpl::~DVPortImpl() = default;

bool DVPortImpl::IsValid() {
  Call call(state_->session.get(), "IsValid", On(state_->param.portId), "");
  return PortExists(*state_);
}

uint32_t DVPortImpl::GetConnectionId() const {
  Call call(state_->session.get(), "GetConnectionId", On(state_->param.portId), "");
  CheckValid(*state_);
  auto select =
      state_->session->Prepare("SELECT connection_id FROM dvport WHERE dvs = ? AND port_id = ?");
  select.Bind(1, state_->dvs).Bind(2, state_->param.portId).Step();
  return static_cast<uint32_t>(select.Int(0));
}

void DVPortImpl::SetConnectionId(uint32_t connectionId) {
  Call call(state_->session.get(), "SetConnectionId", On(state_->param.portId),
            FormatArgs(connectionId));
  CheckValid(*state_);
  Session& session = *state_->session;
  Transaction transaction(session);
  session.Prepare("UPDATE dvport SET connection_id = ? WHERE dvs = ? AND port_id = ?")
      .Bind(1, connectionId)
      .Bind(2, state_->dvs)
      .Bind(3, state_->param.portId)
      .Run();
  transaction.Commit();
  state_->param.connectionId = connectionId;
}

int DVPortImpl::TestDVPortNota() {
  Call call(state_->session.get(), "TestDVPortNota", On(state_->param.portId), "");
  CheckValid(*state_);
  Session& session = *state_->session;
  Transaction transaction(session);
  session.Prepare("INSERT INTO dvport_event(seq, dvs, port_id, kind) VALUES (?, ?, ?, 'nota')")
      .Bind(1, session.NextSeq())
      .Bind(2, state_->dvs)
      .Bind(3, state_->param.portId)
      .Run();
  transaction.Commit();
  return 0;
}

std::string DVPortImpl::GetPortId() {
  Call call(state_->session.get(), "GetPortId", On(state_->param.portId), "");
  return state_->param.portId;
}

bool DVPortImpl::IsInUse(std::vector<std::string>& clients) {
  Call call(state_->session.get(), "IsInUse", On(state_->param.portId), FormatArgs(Detail::Out{}));
  CheckValid(*state_);
  clients.clear();
  auto select = state_->session->Prepare(
      "SELECT name FROM dvport_client WHERE dvs = ? AND port_id = ? ORDER BY seq");
  select.Bind(1, state_->dvs).Bind(2, state_->param.portId);
  while (select.Step()) clients.push_back(select.Text(0));
  return !clients.empty();
}

const DVPortParam& DVPortImpl::GetParam() const {
  Call call(state_->session.get(), "GetParam", On(state_->param.portId), "");
  return state_->param;
}

}  // namespace TarnCtl::Network
