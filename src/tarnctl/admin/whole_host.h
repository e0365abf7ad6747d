// What acts on the whole host: replacing it, rebooting it, showing it (as
// text, JSON and a graph, each printed from the readings of the objects'
// homes), dumping and loading it.
#pragma once

#include <cstddef>
#include <cstdint>
#include <functional>
#include <optional>
#include <string>

#include "tarnctl/instrument/errors.h"

namespace TarnCtl::Store {
class Db;
}

namespace TarnCtl::Admin {

// Replaces the host: the default host, or with `empty` nothing at all.
void Init(Store::Db& db, bool empty);
// Drops the running state, keeps the stored configuration.
void Reboot(Store::Db& db);

// The whole host as readable text: its file, the running state, the
// stored configuration, ENS state, timeouts, armed faults.
std::string Show(Store::Db& db);
// What is named `name`, as text: the standard switch, distributed switch
// and port group of that name in each layer, the opaque switch, and the
// DVPort named "DVS:PORTID"; refuses a name that is none of them.
std::string Show(Store::Db& db, const std::string& name);
// The whole host as JSON for programs, or with `name` what Show(db, name)
// shows (docs/host.md, "JSON").
std::string ShowJson(Store::Db& db, const std::optional<std::string>& name = std::nullopt);
// The refusal of a name that show finds nothing of.
Instrument::Refusal NothingNamed(const std::string& name);
// The whole host as a Graphviz graph (dot language).
std::string ShowDot(Store::Db& db);

// Reports progress of a long operation: rows done so far of `total`.
using Progress = std::function<void(int64_t done, int64_t total)>;

// The whole host as JSON (stable key and row order, ending in a newline);
// LoadHost(DumpHost()) leaves a host whose DumpHost() is the same text.
std::string DumpHost(Store::Db& db, const Progress& progress = nullptr);
// Replaces the whole host with a dump; refuses a malformed or
// inconsistent dump without changing anything. A `json` whose capacity
// exceeds its size by kLoadRoom bytes is read in place, another from a
// copy (which, for a large dump, doubles the memory the load touches).
inline constexpr size_t kLoadRoom = 64;
void LoadHost(Store::Db& db, const std::string& json, const Progress& progress = nullptr);

}  // namespace TarnCtl::Admin
