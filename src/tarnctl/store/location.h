// Where a host lives: a database file, or (for tests) a private database
// in memory. Resolving the location from the environment is a pure
// function of the values given: the caller reads the environment, once, at
// the library's edge.
#pragma once

#include <string>

namespace TarnCtl::Store {

struct Location {
  enum class Kind { kFile, kMemory };
  Kind kind = Kind::kFile;
  std::string path;  // kFile: the file as the user named it; kMemory: a label

  static Location File(std::string path) { return {Kind::kFile, std::move(path)}; }
  static Location Memory(std::string label = ":memory:") {
    return {Kind::kMemory, std::move(label)};
  }
};

// What decides the default location.
struct Environment {
  const char* hostDb = nullptr;     // TARN_HOST_DB
  const char* stateHome = nullptr;  // XDG_STATE_HOME
  const char* home = nullptr;       // HOME
  bool root = false;                // effective user id 0
};

// TARN_HOST_DB when set and not empty; else for root
// /var/lib/tarnhost/host.db; else $XDG_STATE_HOME/tarnhost/host.db when
// that is an absolute path; else $HOME/.local/state/tarnhost/host.db.
// Refuses (HostCtlException) a TARN_HOST_DB that starts with "~": the
// shell expands "~" only at the start of a word, never inside an
// assignment's quotes, so such a path is a mistake.
Location ResolveLocation(const Environment& environment);

// The environment of this process.
Environment ProcessEnvironment();

}  // namespace TarnCtl::Store
