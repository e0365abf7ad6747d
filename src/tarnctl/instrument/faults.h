// Armed failures (store/faults.h) applied to calls.
//
// A call matches a fault when the operation names are equal and the
// fault's target is unset or equals one of the call's names (the object's
// name; for a distributed or opaque switch its switch name or its portset
// name; for lookups, static functions and information-object operations
// the name argument). The first matching fault (in the order they were
// armed) that is not spent is used: with skip > 0 its skip goes down by
// one and the call proceeds; otherwise it fires: its fired count goes up,
// its times goes down by one (unless it fires always; a fault at zero
// stays, spent), the call waits its delay, and then fails with the
// fault's message and detailed message, or with pass goes on. The use is
// part of the run's changes.
//
// The faults are read once per connection and again only after something
// was written through it: an unarmed host costs no query per call.
#pragma once

#include <cstdint>
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

// The fault that fired on a call: its number, and the failure it imposes
// (none: the call goes on).
struct Fired {
  int64_t number;
  std::optional<Refusal> failure;
};

// Applies the first matching fault to this call (after its delay); nothing
// when no fault fired.
std::optional<Fired> TakeFault(Store::Db& db, const char* operation,
                               std::span<const std::string_view> names);

}  // namespace TarnCtl::Instrument
