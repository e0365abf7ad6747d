// What the homes of the host's objects share to print them: a row of a
// list for scripts, text for people, JSON for programs.
#pragma once

#include <string>
#include <vector>

#include "hostctl/join.h"
#include "tarnctl/admin/text_json.h"

namespace TarnCtl::Admin {

using HostCtl::Text::Join;
using Store::Json;

// A row of text fields per object (`tarnhost NOUN list`); an empty field is
// none, and lists of pnics are joined by commas.
using ListRow = std::vector<std::string>;

// Items as people read them: joined by ", ", "(none)" for none.
inline std::string Listed(const std::vector<std::string>& items) {
  return items.empty() ? "(none)" : Join(items, ", ");
}

}  // namespace TarnCtl::Admin
