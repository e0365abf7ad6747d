// The stored form of a teaming policy: a JSON object with the fields of the
// record that are not zero (or empty), e.g.
//   {"flags":16,"uplinkOrder":["pnic0"],"maxActive":1}
// and {} for the empty policy of a new port group; "linkCriteria" is an
// object of the same kind. Missing fields decode as zero. Decoding refuses
// (HostCtlException) text that is not such an object.
//
// A list of names (the uplinks of an opaque switch) is stored as a JSON
// array of strings, e.g. ["pnic2","pnic3"].
#pragma once

#include <string>
#include <vector>

#include "hostctl/records.h"

namespace TarnCtl::Detail {

std::string EncodeTeamingPolicy(const HostCtl::Network::NicTeamingPolicy& policy);
HostCtl::Network::NicTeamingPolicy DecodeTeamingPolicy(const std::string& text);

std::string EncodeNameList(const std::vector<std::string>& names);
std::vector<std::string> DecodeNameList(const std::string& text);

}  // namespace TarnCtl::Detail
