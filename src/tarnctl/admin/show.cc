// The whole host as readable text, for people: its file, pnics, the running state,
// the stored configuration, the distributed switch cache, and what is not
// layered (opaque switches, DVPorts, events, armed faults). Objects come in
// creation order, so two hosts built alike show alike. The dump is the
// exact form; this one leaves out what nobody reads (link criteria).
#include <cstdio>
#include <string>
#include <vector>

#include "hostctl/records.h"
#include "tarnctl/admin/host.h"
#include "tarnctl/admin/state.h"
#include "tarnctl/instrument/call.h"
#include "tarnctl/instrument/trace.h"
#include "tarnctl/model/words.h"
#include "tarnctl/store/distributed.h"
#include "tarnctl/store/dvports.h"
#include "tarnctl/store/ens.h"
#include "tarnctl/store/faults.h"
#include "tarnctl/store/meta.h"
#include "tarnctl/store/opaque.h"
#include "tarnctl/store/pnics.h"
#include "tarnctl/store/policy_codec.h"
#include "tarnctl/store/portgroups.h"
#include "tarnctl/store/standard.h"
#include "tarnctl/store/teaming_fields.h"
#include "tarnctl/store/timeouts.h"

namespace TarnCtl::Admin {
namespace {

using Store::Db;
using Store::Layer;

std::string Join(const std::vector<std::string>& items) {
  if (items.empty()) return "(none)";
  std::string out;
  for (const auto& item : items) out += (out.empty() ? "" : ", ") + item;
  return out;
}

// The fields of a teaming policy that people read, as "label value" pairs.
class TeamingWriter {
 public:
  std::string text = "Teaming:";

  template <typename T>
  void Number(const char* key, const T& value) {
    const std::string field = key;
    if (field == "flags") {
      char hex[32];
      std::snprintf(hex, sizeof hex, "0x%llx", static_cast<unsigned long long>(value));
      ordered_ = value & HostCtl::Network::NicTeamingPolicy::kUplinkOrderSet;
      Add("flags", hex);
    } else {
      Add(field == "maxActive" ? "max active" : key, std::to_string(value));
    }
  }
  void Names(const char*, const std::vector<std::string>& names) {
    Add("order", ordered_ ? Join(names) : "(not set)");
  }
  template <typename Inside>
  void Group(const char*, Inside) {}  // link criteria: left out

 private:
  void Add(const std::string& label, const std::string& value) {
    text += (text.back() == ':' ? " " : ", ") + label + " " + value;
  }
  bool ordered_ = false;
};

std::string Teaming(const std::string& stored) {
  TeamingWriter writer;
  const auto policy = Store::DecodeTeamingPolicy(stored);
  Store::VisitTeamingFields(policy, writer);
  return writer.text;
}

void StandardSwitches(Db& db, std::string& out, Layer layer) {
  const auto switches = Store::Standard::ListAll(db, layer);
  for (const auto& sw : switches) {
    out += "  Standard switch " + sw.name + (sw.row.system ? " (system)" : "") + ": " +
           std::to_string(sw.row.numPorts) + " ports, MTU " + std::to_string(sw.row.mtu) +
           ", CDP " + Model::CdpWord(sw.row.cdp) + "\n";
    out += "    Uplinks: " + Join(Store::Standard::Uplinks(db, layer, sw.name)) + "\n";
    out += "    " + Teaming(sw.row.policy) + "\n";
    for (const auto& group : Store::PortGroups::OnSwitch(db, layer, sw.name)) {
      out += "    Port group " + group.name + ": VLAN " + std::to_string(group.row.vlan) +
             ", clients " + Join(Store::PortGroups::Clients(db, group.name)) + "\n";
      out += "      " + Teaming(group.row.policy) + "\n";
    }
  }
  if (switches.empty()) out += "  Standard switches: (none)\n";
}

void DistributedSwitches(Db& db, std::string& out, Layer layer) {
  const auto switches = Store::Distributed::List(db, layer);
  for (const auto& dvs : switches) {
    const auto& row = dvs.row;
    out += "  Distributed switch " + dvs.name + ": portset " + row.portset + ", id " +
           row.switchId + ", " + std::to_string(row.numPorts) + " ports, MTU " +
           std::to_string(row.mtu) + "\n";
    out += "    UUID " + row.uuid + ", class " + row.implClass + ", version " +
           std::to_string(row.version) + "\n";
    std::vector<std::string> uplinks;
    for (const auto& uplink : Store::Distributed::Uplinks(db, layer, dvs.name)) {
      uplinks.push_back(uplink.pnic + (uplink.portId ? " (DVPort " + *uplink.portId + ")" : ""));
    }
    out += "    Uplinks: " + Join(uplinks) + "\n";
  }
  if (switches.empty()) out += "  Distributed switches: (none)\n";
}

void Timeouts(Db& db, std::string& out, Layer layer) {
  std::vector<std::string> rows;
  for (const auto& record : Store::Timeouts::Uplinks(db, layer, {})) {
    rows.push_back(record.portsetName + " " + record.uplinkName + " LAG " +
                   std::to_string(record.lagId) + ": " + std::to_string(record.timeout));
  }
  out += "  Uplink timeouts: " + Join(rows) + "\n";
  rows.clear();
  for (const auto& record : Store::Timeouts::Lags(db, layer, {})) {
    rows.push_back(record.portsetName + " LAG " + std::to_string(record.lagId) + ": " +
                   std::to_string(record.timeout));
  }
  out += "  LAG timeouts: " + Join(rows) + "\n";
}

void Ens(Db& db, std::string& out) {
  std::vector<std::string> active;
  for (const auto& ens : Store::Ens::List(db)) {
    active.push_back(ens.portset + " (intr " + (ens.intr ? "on" : "off") + ", fast switch " +
                     (ens.fastSwitch ? "on" : "off") + ")");
  }
  out += std::string("  ENS: activation node ") +
         (Store::Meta::EnsNodeSet(db) ? "set" : "not set") + "; active on " + Join(active) + "\n";
}

void Section(std::string& out, const char* title, const std::vector<std::string>& lines) {
  out += std::string("\n") + title + "\n";
  for (const auto& line : lines) out += "  " + line + "\n";
  if (lines.empty()) out += "  (none)\n";
}

std::vector<std::string> OpaqueLines(Db& db) {
  std::vector<std::string> lines;
  for (const auto& opaque : Store::Opaque::List(db)) {
    lines.push_back(opaque.name + ": portset " + opaque.row.portset + ", " +
                    std::to_string(opaque.row.numPorts) + " ports, " +
                    std::to_string(opaque.row.usedPorts) + " used, uplinks " +
                    Join(opaque.row.uplinks));
  }
  return lines;
}

std::vector<std::string> DVPortLines(Db& db) {
  std::vector<std::string> lines;
  for (const auto& [dvs, port] : Store::DVPorts::All(db)) {
    lines.push_back(dvs + " port " + port.portId + ": connection id " +
                    std::to_string(port.connectionId) + ", clients " +
                    Join(Store::DVPorts::Clients(db, dvs, port.portId)));
  }
  return lines;
}

std::vector<std::string> FaultLines(Db& db) {
  std::vector<std::string> lines;
  for (const auto& fault : Store::Faults::List(db)) {
    // Fault texts are free text: shown escaped, so each stays on its line.
    std::string message, detail;
    Instrument::AppendArg(message, fault.message);
    Instrument::AppendArg(detail, fault.detail);
    lines.push_back(fault.operation + (fault.target ? " on " + *fault.target : "") + ": lets " +
                    std::to_string(fault.skip) + " pass, then fails " +
                    std::to_string(fault.times) + "; message " + message + ", detail " + detail);
  }
  return lines;
}

}  // namespace

std::string Host::Show() {
  Db& db = state_->db();
  Instrument::Scope scope(db, "Show");
  std::string out = "Host: " + Path() + "\nPhysical NICs: " + Join(Store::Pnics::Names(db)) + "\n";

  out += "\nRunning state\n";
  StandardSwitches(db, out, Layer::kRunning);
  DistributedSwitches(db, out, Layer::kRunning);
  Ens(db, out);
  Timeouts(db, out, Layer::kRunning);

  out += "\nStored configuration\n";
  StandardSwitches(db, out, Layer::kStored);
  Timeouts(db, out, Layer::kStored);

  out += "\nDistributed switch cache\n";
  DistributedSwitches(db, out, Layer::kStored);

  Section(out, "Opaque switches", OpaqueLines(db));
  Section(out, "DVPorts", DVPortLines(db));
  Section(out, "Events", Store::Ens::EventTexts(db));
  Section(out, "Faults", FaultLines(db));
  return out;
}

}  // namespace TarnCtl::Admin
