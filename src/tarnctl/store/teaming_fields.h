// The fields of a teaming policy, described once: every reader and writer
// of a policy (the stored form, the trace, the dump, `tarnhost show`)
// visits them through VisitTeamingFields in declaration order.
//
// A visitor has
//   void Number(const char* key, T& value)        for each integer field
//   void Names(const char* key, std::vector<std::string>& value)
//   void Group(const char* key, F visitInside)     for linkCriteria; calls
//                                                  visitInside(visitor)
// and is called with const or non-const policies alike.
#pragma once

#include <type_traits>

#include "hostctl/records.h"

namespace TarnCtl::Store {

template <typename Policy, typename Visitor>
requires std::is_same_v<std::remove_const_t<Policy>, HostCtl::Network::NicTeamingPolicy>
void VisitTeamingFields(Policy& policy, Visitor& visitor) {
  visitor.Number("flags", policy.flags);
  visitor.Number("balancing", policy.balancing);
  visitor.Number("failback", policy.failback);
  visitor.Group("linkCriteria", [&](auto& inside) {
    auto& criteria = policy.linkCriteria;
    inside.Number("checkMask", criteria.checkMask);
    inside.Number("minSpeed", criteria.minSpeed);
    inside.Number("errorPercent", criteria.errorPercent);
    inside.Number("fullDuplex", criteria.fullDuplex);
  });
  visitor.Names("uplinkOrder", policy.uplinkOrder);
  visitor.Number("maxActive", policy.maxActive);
}

}  // namespace TarnCtl::Store
