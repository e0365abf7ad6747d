#include "tarnctl/admin/view.h"

namespace TarnCtl::Admin {

std::string Commas(const std::vector<std::string>& names) {
  std::string text;
  for (const auto& name : names) text += (text.empty() ? "" : ",") + name;
  return text;
}

std::string Listed(const std::vector<std::string>& items) {
  if (items.empty()) return "(none)";
  std::string out;
  for (const auto& item : items) out += (out.empty() ? "" : ", ") + item;
  return out;
}

}  // namespace TarnCtl::Admin
