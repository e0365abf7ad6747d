#include "tarnctl/admin/ens.h"

#include "tarnctl/store/meta.h"

namespace TarnCtl::Admin {

Ens EnsOf(Store::Db& db) {
  return {Store::Meta::EnsNodeSet(db), Store::Ens::List(db)};
}

std::vector<std::string> Events(Store::Db& db) {
  return Store::Ens::EventTexts(db);
}

std::string EnsText(const Ens& ens) {
  std::vector<std::string> active;
  for (const auto& on : ens.active) {
    active.push_back(on.portset + " (intr " + (on.intr ? "on" : "off") + ", fast switch " +
                     (on.fastSwitch ? "on" : "off") + ")");
  }
  return std::string("  ENS: activation node ") + (ens.activationNode ? "set" : "not set") +
         "; active on " + Listed(active) + "\n";
}

Json EnsJson(const Ens& ens) {
  Json active = Json::array();
  for (const auto& on : ens.active) {
    active.push_back(
        {{"portset", on.portset}, {"interrupt", on.intr}, {"fastSwitch", on.fastSwitch}});
  }
  return {{"activationNode", ens.activationNode}, {"active", std::move(active)}};
}

}  // namespace TarnCtl::Admin
