// The system-information node interface. These calls never throw: a fault
// armed on NODI_CheckSig or NODI_Set makes it return TARN_FAILURE, one on
// GetIntParamList makes it return nullptr, and a host that cannot be opened
// gives TARN_FAILURE (or nullptr) too.
#include "hostctl/nodi.h"

#include <string>

#include "hostctl/tarnctl.h"
#include "tarnctl/call.h"
#include "tarnctl/nodi_list.h"
#include "tarnctl/session.h"

using TarnCtl::Detail::Call;
using TarnCtl::Detail::FormatArgs;
using TarnCtl::Detail::Nothing;
using TarnCtl::Detail::Out;
using TarnCtl::Detail::Session;

namespace {

// The node interface version this host speaks.
constexpr int kNodiVersion = 21;
constexpr uint32_t kNodiSignature = 0x4e4f4449;  // "NODI"
constexpr uint32_t kNodeCount = 1;

// The session for one node call, or nullptr when the host cannot be opened.
std::shared_ptr<Session> NodeSession() {
  try {
    return Session::Acquire();
  } catch (const HostCtl::Lib::HostCtlException&) {
    return nullptr;
  }
}

// Traces a node call and applies its faults; false when it must fail.
bool Enter(Session* session, const char* operation, const std::string& args) {
  try {
    Call call(session, operation, Nothing(), args, Call::OnFault::kReport);
    return !call.failed();
  } catch (const HostCtl::Lib::HostCtlException&) {
    return false;
  }
}

}  // namespace

int NODI_CheckSig(NODI_SigResult* result, int version, uint32_t* info) {
  const auto session = NodeSession();
  if (!Enter(session.get(), "NODI_CheckSig", FormatArgs(Out{}, version, Out{})) || !session) {
    return TARN_FAILURE;
  }
  if (result == nullptr) return TARN_BAD_PARAM;
  if (version != kNodiVersion) return TARN_VERSION_MISMATCH;
  result->signature = kNodiSignature;
  result->nodeCount = kNodeCount;
  if (info != nullptr) *info = kNodiVersion;
  return TARN_OK;
}

int NODI_Set(NODI_NodeId node, int instance, NODI_ParamList* params, int reserved1, int reserved2) {
  const auto session = NodeSession();
  if (!Enter(session.get(), "NODI_Set", FormatArgs(node, instance, params, reserved1, reserved2)) ||
      !session) {
    return TARN_FAILURE;
  }
  if (node != NODI_NODE_net_ens_activate || instance != 0) return TARN_NOT_FOUND;
  if (params == nullptr || params->type != NODI_PARAM_LIST_INT || params->values.size() != 1) {
    return TARN_BAD_PARAM;
  }
  try {
    TarnCtl::Detail::Transaction transaction(*session);
    session->Prepare("INSERT OR REPLACE INTO meta(key, value) VALUES ('ens_node', ?)")
        .Bind(1, std::to_string(params->values[0]))
        .Run();
    transaction.Commit();
  } catch (const HostCtl::Lib::HostCtlException&) {
    return TARN_FAILURE;
  }
  return TARN_OK;
}

void NODI_ParamListDestroy(NODI_ParamList* params) {
  Call call(nullptr, "NODI_ParamListDestroy", Nothing(), FormatArgs(params));
  delete params;
}

const char* TARN_ReturnStatusToString(int status) {
  Call call(nullptr, "TARN_ReturnStatusToString", Nothing(), FormatArgs(status));
  switch (status) {
    case TARN_OK:
      return "Success";
    case TARN_FAILURE:
      return "Failure";
    case TARN_BAD_PARAM:
      return "Bad parameter";
    case TARN_NOT_FOUND:
      return "Not found";
    case TARN_BUSY:
      return "Busy";
    case TARN_VERSION_MISMATCH:
      return "Version mismatch";
    default:
      return "Unknown status";
  }
}

namespace TarnCtl::Util {

NODI_ParamList* SysinfoUtil::GetIntParamList(uint32_t value, NODI_ParamListType type) {
  const auto session = NodeSession();
  if (!Enter(session.get(), "GetIntParamList", FormatArgs(value, static_cast<int>(type)))) {
    return nullptr;
  }
  if (type != NODI_PARAM_LIST_INT) return nullptr;
  return new NODI_ParamList{type, {value}};
}

}  // namespace TarnCtl::Util
