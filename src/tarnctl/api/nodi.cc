// The system-information node interface. These calls never throw: a fault
// armed on NODI_CheckSig or NODI_Set makes it return TARN_FAILURE, one on
// GetIntParamList makes it return nullptr, and a host that cannot be opened
// gives TARN_FAILURE (or nullptr) too.
#include "hostctl/nodi.h"

#include <string>

#include "hostctl/tarnctl.h"
#include "tarnctl/api/session.h"
#include "tarnctl/instrument/call.h"
#include "tarnctl/instrument/nodi_list.h"
#include "tarnctl/store/meta.h"

using HostCtl::Lib::HostCtlException;
using TarnCtl::Api::Session;
using TarnCtl::Instrument::Nothing;
using TarnCtl::Instrument::Out;

namespace {

// The node interface version this host speaks.
constexpr int kNodiVersion = 21;
constexpr uint32_t kNodiSignature = 0x4e4f4449;  // "NODI"
constexpr uint32_t kNodeCount = 1;

// The session for one node call, or nullptr when the host cannot be opened.
std::shared_ptr<Session> NodeSession() {
  try {
    return Session::Acquire();
  } catch (const HostCtlException&) {
    return nullptr;
  }
}

TarnCtl::Store::Db* DbOf(const std::shared_ptr<Session>& session) {
  return session ? &session->db() : nullptr;
}

}  // namespace

int NODI_CheckSig(NODI_SigResult* result, int version, uint32_t* info) {
  const auto session = NodeSession();
  try {
    TARN_CALL_REPORTING(DbOf(session), NODI_CheckSig, Nothing(), Out{}, version, Out{});
    if (tarn_call_.failed() || !session) return TARN_FAILURE;
  } catch (const HostCtlException&) {
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
  try {
    TARN_CALL_REPORTING(DbOf(session), NODI_Set, Nothing(), node, instance,
                        static_cast<const NODI_ParamList*>(params), reserved1, reserved2);
    if (tarn_call_.failed() || !session) return TARN_FAILURE;
    if (node != NODI_NODE_net_ens_activate || instance != 0) return TARN_NOT_FOUND;
    if (params == nullptr || params->type != NODI_PARAM_LIST_INT || params->values.size() != 1) {
      return TARN_BAD_PARAM;
    }
    TarnCtl::Store::Meta::SetEnsNode(session->db(), params->values[0]);
  } catch (const HostCtlException&) {
    return TARN_FAILURE;
  }
  return TARN_OK;
}

void NODI_ParamListDestroy(NODI_ParamList* params) {
  TARN_CALL(nullptr, NODI_ParamListDestroy, Nothing(), static_cast<const NODI_ParamList*>(params));
  delete params;
}

const char* TARN_ReturnStatusToString(int status) {
  TARN_CALL(nullptr, TARN_ReturnStatusToString, Nothing(), status);
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
  try {
    TARN_CALL_REPORTING(DbOf(session), GetIntParamList, Nothing(), value, static_cast<int>(type));
    if (tarn_call_.failed()) return nullptr;
  } catch (const HostCtlException&) {
    return nullptr;
  }
  if (type != NODI_PARAM_LIST_INT) return nullptr;
  return new NODI_ParamList{type, {value}};
}

}  // namespace TarnCtl::Util
