// What holds of every host the library makes, across rows and tables: what
// a row refers to exists, a running pnic or switch name is used once, a
// running switch has no more users than ports. The library's operations
// keep these by their checks; a host from outside (a loaded dump) is held
// against this list.
//
// Deliberately not invariants, because the library leaves such states:
// clients of a port group that exists in no layer (they wait for it),
// DVPorts of a switch that left the cache, and names or pnics that the
// stored layers share with the running state.
#pragma once

#include <optional>
#include <string>

namespace TarnCtl::Store {
class Db;
}

namespace TarnCtl::Model {

// The first invariant the host breaks, in words; nothing when it keeps all.
std::optional<std::string> FirstViolation(Store::Db& db);

}  // namespace TarnCtl::Model
