// ENS: whether the activation node is set, the portsets it is active on,
// and the events the host recorded; one reading, printed as text and JSON.
// The tool changes them; administration only shows them.
#pragma once

#include <string>
#include <vector>

#include "tarnctl/admin/view.h"
#include "tarnctl/store/ens.h"

namespace TarnCtl::Admin {

struct Ens {
  bool activationNode = false;
  std::vector<Store::Ens::Active> active;
};

Ens EnsOf(Store::Db& db);
// The events, as texts, in the order they happened.
std::vector<std::string> Events(Store::Db& db);

// The line of `tarnhost show`.
std::string EnsText(const Ens& ens);
Json EnsJson(const Ens& ens);

}  // namespace TarnCtl::Admin
