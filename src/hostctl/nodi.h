// The kernel's system-information node interface.
//
// Plain calls that never throw: each returns a status code, 0 for success.
// TARN_ReturnStatusToString gives a printable text for any code.
#pragma once

#include <cstdint>

// A list of node parameters; made by TarnCtl::Util::SysinfoUtil and
// released with NODI_ParamListDestroy.
struct NODI_ParamList;

enum NODI_ParamListType : int {
  NODI_PARAM_LIST_INT = 0,
};

using NODI_NodeId = uint16_t;

// Result area filled by the signature check.
struct NODI_SigResult {
  uint32_t signature = 0;
  uint32_t nodeCount = 0;
};

// Kernel status codes.
enum : int {
  TARN_OK = 0,
  TARN_FAILURE = 1,
  TARN_BAD_PARAM = 2,
  TARN_NOT_FOUND = 3,
  TARN_BUSY = 4,
  TARN_VERSION_MISMATCH = 5,
};

// The node that marks ENS active host-wide.
extern const NODI_NodeId NODI_NODE_net_ens_activate;

int NODI_CheckSig(NODI_SigResult* result, int version, uint32_t* info);
int NODI_Set(NODI_NodeId node, int instance, NODI_ParamList* params, int reserved1, int reserved2);
void NODI_ParamListDestroy(NODI_ParamList* params);
const char* TARN_ReturnStatusToString(int status);
