#include "tarnctl/model/names.h"

#include "hostctl/network.h"
#include "tarnctl/instrument/errors.h"
#include "tarnctl/store/distributed.h"
#include "tarnctl/store/names.h"
#include "tarnctl/store/opaque.h"
#include "tarnctl/store/pnics.h"
#include "tarnctl/store/standard.h"

namespace TarnCtl::Model {

using Instrument::Refused;
using Store::Layer;

namespace {

constexpr size_t kLongName = 127;

// The first byte of `text` that is a control character (C0, DEL or, as
// UTF-8, C1), as its 1-based position.
size_t ControlAt(std::string_view text) {
  for (size_t i = 0; i < text.size(); ++i) {
    const auto byte = static_cast<unsigned char>(text[i]);
    if (byte < 0x20 || byte == 0x7f) return i + 1;
    if (byte == 0xc2 && i + 1 < text.size()) {
      const auto next = static_cast<unsigned char>(text[i + 1]);
      if (next >= 0x80 && next <= 0x9f) return i + 1;
    }
  }
  return 0;
}

}  // namespace

const NameRule& RuleOf(NameKind kind) {
  // Switch, portset and pnic names must fit the platform's name buffers.
  static const size_t kShortName = HostCtl::Network::Portset::MAX_VSNAME_SZ - 1;
  static const NameRule kRules[] = {
      {"Virtual switch name", kShortName, true},  // kSwitch
      {"Portset name", kShortName, true},         // kPortset
      {"Pnic name", kShortName, true},            // kPnic
      {"Uplink name", kShortName, true},          // kUplink
      {"Portgroup name", kLongName, false},       // kPortGroup
      {"Client name", kLongName, false},          // kClient
      {"DVPort id", kLongName, false},            // kDVPort
      {"Switch id", kLongName, false},            // kSwitchId
      {"Fault target", kLongName, false},         // kFaultTarget
  };
  return kRules[static_cast<size_t>(kind)];
}

bool IsUtf8(std::string_view text) {
  const auto* p = reinterpret_cast<const unsigned char*>(text.data());
  const auto* end = p + text.size();
  while (p < end) {
    const unsigned c = *p++;
    if (c < 0x80) continue;
    int more = 0;
    unsigned point = 0;
    if (c >= 0xc2 && c <= 0xdf) {
      more = 1, point = c & 0x1f;
    } else if (c >= 0xe0 && c <= 0xef) {
      more = 2, point = c & 0x0f;
    } else if (c >= 0xf0 && c <= 0xf4) {
      more = 3, point = c & 0x07;
    } else {
      return false;
    }
    if (end - p < more) return false;
    for (int i = 0; i < more; ++i) {
      if ((p[i] & 0xc0) != 0x80) return false;
      point = (point << 6) | (p[i] & 0x3f);
    }
    p += more;
    if ((more == 2 && point < 0x800) || (more == 3 && point < 0x10000) || point > 0x10ffff ||
        (point >= 0xd800 && point <= 0xdfff)) {
      return false;
    }
  }
  return true;
}

void CheckName(NameKind kind, const std::string& name) {
  const NameRule& rule = RuleOf(kind);
  const std::string what = rule.what;
  if (name.empty()) throw Refused(what + " is empty");
  // The name itself is not repeated in these two: it is what cannot be shown.
  if (!IsUtf8(name)) throw Refused(what + " is not valid UTF-8 text");
  if (const size_t at = ControlAt(name); at != 0) {
    throw Refused(what + " contains a control character", "(byte " + std::to_string(at) + ")");
  }
  if (name.size() > rule.maxBytes) {
    throw Refused(what + " " + name + " is too long",
                  "(at most " + std::to_string(rule.maxBytes) + " bytes)");
  }
  if (rule.commaFree && name.find(',') != std::string::npos) {
    throw Refused(what + " " + name + " contains a comma",
                  "(such names are listed comma-separated)");
  }
}

std::optional<PortsetName> FindPortset(Store::Db& db, const std::string& portset) {
  if (Store::Standard::Exists(db, Layer::kRunning, portset)) {
    return PortsetName{PortsetKind::kStandard, portset, portset};
  }
  if (auto name = Store::Distributed::NameOfPortset(db, Layer::kRunning, portset)) {
    return PortsetName{PortsetKind::kDistributed, *name, portset};
  }
  if (auto name = Store::Opaque::NameOfPortset(db, portset)) {
    return PortsetName{PortsetKind::kOpaque, *name, portset};
  }
  return std::nullopt;
}

void CheckNewSwitchName(Store::Db& db, NameKind kind, const std::string& name) {
  CheckName(kind, name);
  if (Store::Names::SwitchNameTaken(db, name)) {
    throw Refused("Virtual switch " + name + " already exists", "on this host");
  }
}

std::optional<std::string> PnicOwner(Store::Db& db, const std::string& pnic) {
  if (auto linked = Store::Pnics::LinkedSwitch(db, Layer::kRunning, pnic)) return linked;
  return Store::Pnics::OpaqueHolder(db, pnic);
}

void CheckFreePnic(Store::Db& db, const std::string& pnic) {
  if (!Store::Pnics::Exists(db, pnic)) {
    throw Refused("Uplink " + pnic + " does not exist", "on this host");
  }
  if (const auto owner = PnicOwner(db, pnic)) {
    throw Refused(pnic + " is already linked to " + *owner);
  }
}

void CheckRemovablePnic(Store::Db& db, const std::string& pnic) {
  if (!Store::Pnics::Exists(db, pnic)) throw Refused("Pnic " + pnic + " does not exist");
  if (const auto owner = PnicOwner(db, pnic)) {
    throw Refused("Pnic " + pnic + " is linked to " + *owner);
  }
  if (const auto stored = Store::Pnics::LinkedSwitch(db, Layer::kStored, pnic)) {
    throw Refused("Pnic " + pnic + " is linked to " + *stored + " in the stored configuration",
                  "(a restore would link it again)");
  }
}

}  // namespace TarnCtl::Model
