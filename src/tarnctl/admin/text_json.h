// Texts in the JSON documents the administration writes (dumps and
// `tarnhost show --json`): valid UTF-8 as a string, any other bytes as
// {"hex": "<its bytes in lower-case hex>"}, so that every document is JSON
// and gives back the exact bytes.
#pragma once

#include <string>
#include <vector>

#include "tarnctl/store/policy_codec.h"

namespace TarnCtl::Admin {

Store::Json TextJson(const std::string& text);
// An array of TextJson values.
Store::Json NamesJson(const std::vector<std::string>& names);
// A teaming policy in its stored form (policy_codec.h) as its full JSON
// form, its uplink order made of TextJson values.
Store::Json PolicyJson(const std::string& stored);

}  // namespace TarnCtl::Admin
