// Armed failures (table `fault`).
//
// A call matches a row when the operation names are equal and the row's
// target is NULL or equals one of the call's names (the object's name; for a
// distributed switch its switch name or its portset name; for lookups,
// static functions and information-object operations the name argument).
// The first matching row (lowest id) that still has skip or times left is
// used: with skip > 0 its skip is decremented and the call proceeds;
// otherwise its times is decremented (the row is deleted at 0) and the call
// fails with the row's message and detailed message. The decrement is
// committed at once, so faults are used up across processes.
//
// The table is read once per session and read again only after something
// was written through the session; an unarmed host costs no query per call.
#pragma once

#include <optional>
#include <string>
#include <vector>

#include "hostctl/exception.h"

namespace TarnCtl::Detail {

class Session;

// The failure a fault imposes on this call, or nothing.
std::optional<HostCtl::Lib::HostCtlException> TakeFault(Session& session,
                                                        const std::string& operation,
                                                        const std::vector<std::string>& names);

}  // namespace TarnCtl::Detail
