// A node parameter list of the system-information node interface.
#pragma once

#include <cstdint>
#include <vector>

#include "hostctl/nodi.h"

struct NODI_ParamList {
  NODI_ParamListType type = NODI_PARAM_LIST_INT;
  std::vector<uint32_t> values;
};
