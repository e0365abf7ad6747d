#include "tarnctl/policy_codec.h"

#include <limits>
#include <nlohmann/json.hpp>

#include "hostctl/exception.h"

namespace TarnCtl::Detail {

using HostCtl::Lib::HostCtlException;
using HostCtl::Network::NicTeamingPolicy;
using Json = nlohmann::ordered_json;

namespace {

[[noreturn]] void Malformed(const std::string& what, const std::string& text) {
  throw HostCtlException("Stored " + what + " is malformed",
                         "Stored " + what + " is malformed: " + text);
}

// The unsigned member `key` of `object`, no larger than `max`.
uint64_t Unsigned(const Json& object, const char* key, uint64_t max, const std::string& text) {
  const auto found = object.find(key);
  if (found == object.end()) return 0;
  if (!found->is_number_unsigned()) Malformed("teaming policy", text);
  const uint64_t value = found->get<uint64_t>();
  if (value > max) Malformed("teaming policy", text);
  return value;
}

// JSON text of `json`; names that are not UTF-8 cannot be stored.
std::string Dump(const Json& json) {
  try {
    return json.dump();
  } catch (const nlohmann::json::exception&) {
    throw HostCtlException("Uplink names must be valid UTF-8 text",
                           "Uplink names must be valid UTF-8 text to be stored");
  }
}

Json ParseJson(const std::string& what, const std::string& text) {
  Json json = Json::parse(text, nullptr, false);
  if (json.is_discarded()) Malformed(what, text);
  return json;
}

std::vector<std::string> Names(const Json& json, const std::string& what, const std::string& text) {
  if (!json.is_array()) Malformed(what, text);
  std::vector<std::string> names;
  for (const auto& name : json) {
    if (!name.is_string()) Malformed(what, text);
    names.push_back(name.get<std::string>());
  }
  return names;
}

}  // namespace

std::string EncodeTeamingPolicy(const NicTeamingPolicy& policy) {
  // Fields at their zero value are left out: most port groups carry the
  // empty policy, and short rows keep the port group table shallow.
  Json criteria = Json::object();
  if (policy.linkCriteria.checkMask) criteria["checkMask"] = policy.linkCriteria.checkMask;
  if (policy.linkCriteria.minSpeed) criteria["minSpeed"] = policy.linkCriteria.minSpeed;
  if (policy.linkCriteria.errorPercent) criteria["errorPercent"] = policy.linkCriteria.errorPercent;
  if (policy.linkCriteria.fullDuplex) criteria["fullDuplex"] = policy.linkCriteria.fullDuplex;
  Json json = Json::object();
  if (policy.flags) json["flags"] = policy.flags;
  if (policy.balancing) json["balancing"] = policy.balancing;
  if (policy.failback) json["failback"] = policy.failback;
  if (!criteria.empty()) json["linkCriteria"] = criteria;
  if (!policy.uplinkOrder.empty()) json["uplinkOrder"] = policy.uplinkOrder;
  if (policy.maxActive) json["maxActive"] = policy.maxActive;
  return Dump(json);
}

NicTeamingPolicy DecodeTeamingPolicy(const std::string& text) {
  const Json json = ParseJson("teaming policy", text);
  if (!json.is_object()) Malformed("teaming policy", text);
  NicTeamingPolicy policy;
  policy.flags = Unsigned(json, "flags", std::numeric_limits<uint64_t>::max(), text);
  policy.balancing = static_cast<uint16_t>(
      Unsigned(json, "balancing", std::numeric_limits<uint16_t>::max(), text));
  policy.failback =
      static_cast<uint8_t>(Unsigned(json, "failback", std::numeric_limits<uint8_t>::max(), text));
  const auto found = json.find("linkCriteria");
  const Json none = Json::object();
  const Json* criteria = found == json.end() ? &none : &*found;
  if (!criteria->is_object()) Malformed("teaming policy", text);
  policy.linkCriteria.checkMask =
      Unsigned(*criteria, "checkMask", std::numeric_limits<uint64_t>::max(), text);
  policy.linkCriteria.minSpeed =
      Unsigned(*criteria, "minSpeed", std::numeric_limits<uint64_t>::max(), text);
  policy.linkCriteria.errorPercent = static_cast<uint32_t>(
      Unsigned(*criteria, "errorPercent", std::numeric_limits<uint32_t>::max(), text));
  policy.linkCriteria.fullDuplex = static_cast<uint8_t>(
      Unsigned(*criteria, "fullDuplex", std::numeric_limits<uint8_t>::max(), text));
  if (const auto order = json.find("uplinkOrder"); order != json.end()) {
    policy.uplinkOrder = Names(*order, "teaming policy", text);
  }
  const auto maxActive = json.find("maxActive");
  if (maxActive == json.end()) return policy;
  if (!maxActive->is_number_integer()) Malformed("teaming policy", text);
  const int64_t active = maxActive->get<int64_t>();
  if (active < std::numeric_limits<int32_t>::min() ||
      active > std::numeric_limits<int32_t>::max()) {
    Malformed("teaming policy", text);
  }
  policy.maxActive = static_cast<int32_t>(active);
  return policy;
}

std::string EncodeNameList(const std::vector<std::string>& names) {
  return Dump(Json(names));
}

std::vector<std::string> DecodeNameList(const std::string& text) {
  return Names(ParseJson("name list", text), "name list", text);
}

}  // namespace TarnCtl::Detail
