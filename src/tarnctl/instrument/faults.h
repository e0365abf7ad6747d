// Armed failures (store/faults.h) applied to calls.
//
// A call matches a fault when the operation names are equal and the
// fault's target is unset or equals one of the call's names (the object's
// name; for a distributed or opaque switch its switch name or its portset
// name; for lookups, static functions and information-object operations
// the name argument). The first matching fault (in the order they were
// armed) that still has skip or times left is used: with skip > 0 its skip
// goes down by one and the call proceeds; otherwise its times goes down by
// one (the fault goes at zero) and the call fails with the fault's message
// and detailed message. The use is part of the run's changes.
//
// The faults are read once per connection and again only after something
// was written through it: an unarmed host costs no query per call.
#pragma once

#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "tarnctl/instrument/errors.h"

namespace TarnCtl::Store {
class Db;
}

namespace TarnCtl::Instrument {

// The failure a fault imposes on this call, or nothing.
std::optional<Refusal> TakeFault(Store::Db& db, const char* operation,
                                 std::span<const std::string_view> names);

}  // namespace TarnCtl::Instrument
