// The stored form of a teaming policy: a JSON object with every field of
// the record, e.g.
//   {"flags":16,"balancing":0,"failback":0,
//    "linkCriteria":{"checkMask":0,"minSpeed":0,"errorPercent":0,"fullDuplex":0},
//    "uplinkOrder":["pnic0"],"maxActive":1}
// Decoding refuses (HostCtlException) text that is not such an object.
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
