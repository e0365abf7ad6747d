// The differences between two states of a host, object by object: what
// came, what went, and each field that changed, with the layer it changed
// in. The objects are read by their homes (the same one reading that
// `tarnhost show` prints), and a field is a key of the object's JSON there
// (nested keys joined by '.').
#pragma once

#include <optional>
#include <string>
#include <vector>

#include "tarnctl/admin/view.h"
#include "tarnctl/store/layer.h"

namespace TarnCtl::Store {
class Db;
}

namespace TarnCtl::Admin {

struct Difference {
  std::string kind;  // "vswitch", "portgroup", "fault", ...
  std::string name;
  std::string owner;                  // where it sits (a port group's switch); empty: nowhere
  std::optional<Store::Layer> layer;  // none: the object has no layers
  std::string field;                  // empty: the whole object came or went
  Json from;                          // null: it came
  Json to;                            // null: it went
};

// From `from` to `to`: kinds in a fixed order, the objects of each in
// creation order (those of `from`, then those that came).
std::vector<Difference> DiffHosts(Store::Db& from, Store::Db& to);
// From the running state to the stored configuration of one host: what a
// reboot would lose ("-", and the running value first) and a restore bring
// back ("+"), with no layer on each.
std::vector<Difference> DiffLayers(Store::Db& db);

// A line each: "KIND NAME [LAYERS]: FIELD FROM -> TO", "+ KIND NAME [on
// OWNER] [LAYERS]" or "- ..."; a change made alike in both layers is one
// line naming both.
std::string DiffText(const std::vector<Difference>& differences);
// An array of records: kind, name, layer, field, from, to.
Json DiffJson(const std::vector<Difference>& differences);

}  // namespace TarnCtl::Admin
