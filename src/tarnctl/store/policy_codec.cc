#include "tarnctl/store/policy_codec.h"

#include <algorithm>
#include <limits>
#include <type_traits>

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

class Reader {
 public:
  Reader(const Json& object, PolicyForm form, std::string where)
      : object_(object), form_(form), where_(std::move(where)) {
    if (!object_.is_object()) throw FormatError(where_ + "must be an object");
  }

  template <typename T>
  void Number(const char* key, T& value) {
    const Json* field = Find(key);
    value = 0;
    if (field == nullptr) return;
    bool fits = false;
    if (field->is_number_unsigned()) {
      fits = field->get<uint64_t>() <= static_cast<uint64_t>(std::numeric_limits<T>::max());
    } else if (field->is_number_integer()) {
      fits = field->get<int64_t>() >= static_cast<int64_t>(std::numeric_limits<T>::min());
    }
    if (!fits) {
      throw FormatError(where_ + key + " must be an integer from " +
                        std::to_string(std::numeric_limits<T>::min()) + " to " +
                        std::to_string(std::numeric_limits<T>::max()));
    }
    value = field->get<T>();
  }
  void Names(const char* key, std::vector<std::string>& names) {
    const Json* field = Find(key);
    names.clear();
    if (field == nullptr) return;
    try {
      names = NamesFromJson(*field);
    } catch (const FormatError& e) {
      throw FormatError(where_ + key + " " + e.what());
    }
  }
  template <typename Inside>
  void Group(const char* key, Inside inside) {
    static const Json kEmpty = Json::object();
    const Json* field = Find(key);
    Reader reader(field != nullptr ? *field : kEmpty, form_, where_ + key + ".");
    inside(reader);
    reader.RefuseUnknownKeys();
  }

  void RefuseUnknownKeys() {
    if (form_ != PolicyForm::kFull) return;
    for (const auto& item : object_.items()) {
      if (std::find(seen_.begin(), seen_.end(), item.key()) == seen_.end()) {
        throw FormatError(where_ + item.key() + " is not a field");
      }
    }
  }

 private:
  const Json* Find(const char* key) {
    seen_.push_back(key);
    const auto found = object_.find(key);
    if (found != object_.end()) return &*found;
    if (form_ == PolicyForm::kFull) throw FormatError(where_ + key + " is missing");
    return nullptr;
  }

  const Json& object_;
  PolicyForm form_;
  std::string where_;
  std::vector<std::string_view> seen_;  // keys are literals
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
  NicTeamingPolicy policy;
  Reader reader(json, form, "");
  VisitTeamingFields(policy, reader);
  reader.RefuseUnknownKeys();
  return policy;
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
