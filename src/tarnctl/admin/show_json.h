// The host as one JSON document for programs (`tarnhost show --json`), and
// what the graph (`tarnhost show --dot`) is drawn from. docs/host.md, "JSON",
// describes the shape: keys in camelCase, words instead of codes, the
// layered objects under "running" and "stored", arrays in creation order.
#pragma once

#include <optional>
#include <string>

#include "tarnctl/store/policy_codec.h"

namespace TarnCtl::Store {
class Db;
}

namespace TarnCtl::Admin::View {

// The whole host.
Store::Json WholeHost(Store::Db& db);

// The standard switch, distributed switch and port group named `name`:
// {"name": NAME, KIND: {"running": ..., "stored": ...}, ...} with a key for
// each kind that has an object of that name in some layer; nothing when
// none has.
std::optional<Store::Json> Named(Store::Db& db, const std::string& name);

}  // namespace TarnCtl::Admin::View
