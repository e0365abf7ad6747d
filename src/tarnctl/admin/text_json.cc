#include "tarnctl/admin/text_json.h"

#include "tarnctl/model/names.h"

namespace TarnCtl::Admin {

Store::Json TextJson(const std::string& text) {
  if (Model::IsUtf8(text)) return text;
  static const char* hex = "0123456789abcdef";
  std::string digits;
  for (const unsigned char c : text) digits += {hex[c >> 4], hex[c & 15]};
  return Store::Json{{"hex", digits}};
}

Store::Json NamesJson(const std::vector<std::string>& names) {
  Store::Json array = Store::Json::array();
  for (const auto& name : names) array.push_back(TextJson(name));
  return array;
}

Store::Json PolicyJson(const std::string& stored) {
  const auto policy = Store::DecodeTeamingPolicy(stored);
  Store::Json json = Store::PolicyToJson(policy, Store::PolicyForm::kFull);
  json["uplinkOrder"] = NamesJson(policy.uplinkOrder);
  return json;
}

}  // namespace TarnCtl::Admin
