#include "tarnctl/store/policy_codec.h"

#include <limits>

#include "hostctl/exception.h"
#include "tarnctl/store/teaming_fields.h"

namespace TarnCtl::Store {

using HostCtl::Lib::HostCtlException;
using HostCtl::Network::NicTeamingPolicy;

namespace {

class Writer {
 public:
  Writer(Json& object, PolicyForm form) : object_(object), form_(form) {}

  template <typename T>
  void Number(const char* key, const T& value) {
    if (form_ == PolicyForm::kFull || value != 0) object_[key] = value;
  }
  void Names(const char* key, const std::vector<std::string>& names) {
    if (form_ == PolicyForm::kFull || !names.empty()) object_[key] = names;
  }
  template <typename Inside>
  void Group(const char* key, Inside inside) {
    Json group = Json::object();
    Writer writer(group, form_);
    inside(writer);
    if (form_ == PolicyForm::kFull || !group.empty()) object_[key] = std::move(group);
  }

 private:
  Json& object_;
  PolicyForm form_;
};

// A value of the JSON library, as ReadTeamingPolicy reads it.
class JsonNode {
 public:
  JsonNode() = default;
  explicit JsonNode(const Json& json) : json_(&json) {}

  bool Object(size_t& fields) const {
    fields = json_ != nullptr ? json_->size() : 0;
    return json_ == nullptr || json_->is_object();
  }
  bool Field(const char* key, JsonNode& field) const {
    if (json_ == nullptr) return false;
    const auto found = json_->find(key);
    if (found == json_->end()) return false;
    field = JsonNode(*found);
    return true;
  }
  bool Int64(int64_t& number) const {
    if (json_->is_number_unsigned()) {
      const auto value = json_->get<uint64_t>();
      number = static_cast<int64_t>(value);
      return value <= static_cast<uint64_t>(std::numeric_limits<int64_t>::max());
    }
    if (!json_->is_number_integer()) return false;
    number = json_->get<int64_t>();
    return true;
  }
  bool Uint64(uint64_t& number) const {
    if (!json_->is_number_unsigned()) return false;
    number = json_->get<uint64_t>();
    return true;
  }
  bool Names(std::vector<std::string>& names) const {
    try {
      names = NamesFromJson(*json_);
      return true;
    } catch (const FormatError&) {
      return false;
    }
  }
  [[noreturn]] void Fail(const std::string& why) const { throw FormatError(why); }

 private:
  const Json* json_ = nullptr;  // nullptr: an empty object
};

[[noreturn]] void Malformed(const std::string& what, const std::string& text) {
  throw HostCtlException("Stored " + what + " is malformed",
                         "Stored " + what + " is malformed: " + text);
}

// JSON text of `json`; names that are not UTF-8 cannot be stored.
std::string Text(const Json& json) {
  try {
    return json.dump();
  } catch (const nlohmann::json::exception&) {
    throw HostCtlException("Uplink names must be valid UTF-8 text",
                           "Uplink names must be valid UTF-8 text to be stored");
  }
}

Json Parse(const std::string& what, const std::string& text) {
  Json json = Json::parse(text, nullptr, false);
  if (json.is_discarded()) Malformed(what, text);
  return json;
}

}  // namespace

Json PolicyToJson(const NicTeamingPolicy& policy, PolicyForm form) {
  Json json = Json::object();
  Writer writer(json, form);
  VisitTeamingFields(policy, writer);
  return json;
}

NicTeamingPolicy PolicyFromJson(const Json& json, PolicyForm form) {
  return ReadTeamingPolicy(JsonNode(json), form);
}

std::string EncodeTeamingPolicy(const NicTeamingPolicy& policy) {
  // Fields at their zero value are left out: most port groups carry the
  // empty policy, and short rows keep the port group table shallow.
  return Text(PolicyToJson(policy, PolicyForm::kStored));
}

NicTeamingPolicy DecodeTeamingPolicy(const std::string& text) {
  // Most port groups have the empty policy: no parse for it.
  if (text == "{}") return {};
  try {
    return PolicyFromJson(Parse("teaming policy", text), PolicyForm::kStored);
  } catch (const FormatError&) {
    Malformed("teaming policy", text);
  }
}

std::vector<std::string> NamesFromJson(const Json& json) {
  if (!json.is_array()) throw FormatError("must be an array of names");
  std::vector<std::string> names;
  names.reserve(json.size());
  for (const auto& name : json) {
    if (!name.is_string()) throw FormatError("must be an array of names");
    names.push_back(name.get<std::string>());
  }
  return names;
}

std::string EncodeNameList(const std::vector<std::string>& names) {
  return Text(Json(names));
}

std::vector<std::string> DecodeNameList(const std::string& text) {
  if (text == "[]") return {};
  try {
    return NamesFromJson(Parse("name list", text));
  } catch (const FormatError&) {
    Malformed("name list", text);
  }
}

}  // namespace TarnCtl::Store
