// Teaming policies and name lists as JSON.
//
// The stored form of a policy (the `policy` columns) is a JSON object with
// the fields that are not zero or empty, e.g.
//   {"flags":16,"uplinkOrder":["pnic0"],"maxActive":1}
// and {} for the empty policy of a new port group; missing fields read as
// zero. The full form (dumps) has every field. A list of names (the
// uplinks of an opaque switch) is stored as a JSON array of strings.
#pragma once

#include <nlohmann/json.hpp>
#include <stdexcept>
#include <string>
#include <vector>

#include "hostctl/records.h"
#include "tarnctl/store/teaming_fields.h"

namespace TarnCtl::Store {

using Json = nlohmann::ordered_json;

// A policy or name list whose JSON does not have the expected shape; what()
// says what is wrong, naming the field.
struct FormatError : std::runtime_error {
  using std::runtime_error::runtime_error;
};

Json PolicyToJson(const HostCtl::Network::NicTeamingPolicy& policy, PolicyForm form);
// Throws FormatError.
HostCtl::Network::NicTeamingPolicy PolicyFromJson(const Json& json, PolicyForm form);

// The stored text of a policy, and back (HostCtlException "Stored teaming
// policy is malformed" for text that is not one).
std::string EncodeTeamingPolicy(const HostCtl::Network::NicTeamingPolicy& policy);
HostCtl::Network::NicTeamingPolicy DecodeTeamingPolicy(const std::string& text);

std::string EncodeNameList(const std::vector<std::string>& names);
std::vector<std::string> DecodeNameList(const std::string& text);
// Throws FormatError.
std::vector<std::string> NamesFromJson(const Json& json);

}  // namespace TarnCtl::Store
