// The whole host: replacing and rebooting it, and showing it as readable
// text, for people: its file, pnics, the running state, the stored
// configuration, the distributed switch cache, and what is not layered
// (opaque switches, DVPorts, events, armed faults). Objects come in
// creation order, so two hosts built alike show alike. The dump is the
// exact form; this one leaves out what nobody reads (link criteria).
#include "tarnctl/admin/whole_host.h"

#include <string>
#include <vector>

#include "tarnctl/admin/distributed.h"
#include "tarnctl/admin/dvport.h"
#include "tarnctl/admin/ens.h"
#include "tarnctl/admin/faults.h"
#include "tarnctl/admin/opaque.h"
#include "tarnctl/admin/pnic.h"
#include "tarnctl/admin/standard.h"
#include "tarnctl/admin/timeouts.h"
#include "tarnctl/instrument/call.h"
#include "tarnctl/instrument/errors.h"
#include "tarnctl/store/db.h"
#include "tarnctl/store/reset.h"
#include "tarnctl/store/transaction.h"

namespace TarnCtl::Admin {
namespace {

using Store::Layer;

void StandardSection(Store::Db& db, std::string& out, Layer layer) {
  const auto switches = StandardSwitches(db, layer);
  for (const auto& sw : switches) out += StandardSwitchText(sw);
  if (switches.empty()) out += "  Standard switches: (none)\n";
}

void DistributedSection(Store::Db& db, std::string& out, Layer layer) {
  const auto switches = DVSwitches(db, layer);
  for (const auto& dvs : switches) out += DVSwitchText(dvs);
  if (switches.empty()) out += "  Distributed switches: (none)\n";
}

// A titled section of lines, each made by `text` from an object.
template <typename Objects, typename Text>
void Section(std::string& out, const char* title, const Objects& objects, Text text) {
  out += std::string("\n") + title + "\n";
  for (const auto& object : objects) out += "  " + text(object) + "\n";
  if (objects.empty()) out += "  (none)\n";
}

}  // namespace

Instrument::Refusal NothingNamed(const std::string& name) {
  return Instrument::Refused("No switch, port group or DVPort is named " + name,
                             "in either layer (a DVPort is named DVS:PORTID)");
}

void Init(Store::Db& db, bool empty) {
  Instrument::Scope scope(db, "Init");
  Store::Transaction transaction(db);
  Store::Reset::Rebuild(db, empty);
  transaction.Commit();
}

void Reboot(Store::Db& db) {
  Instrument::Scope scope(db, "Reboot");
  Store::Transaction transaction(db);
  Store::Reset::Reboot(db);
  transaction.Commit();
}

std::string Show(Store::Db& db) {
  Instrument::Scope scope(db, "Show");
  std::string out = "Host: " + db.path() + "\nPhysical NICs: " + Listed(PnicNames(db)) + "\n";

  out += "\nRunning state\n";
  StandardSection(db, out, Layer::kRunning);
  DistributedSection(db, out, Layer::kRunning);
  out += EnsText(EnsOf(db));
  out += TimeoutsText(TimeoutsOf(db, Layer::kRunning));

  out += "\nStored configuration\n";
  StandardSection(db, out, Layer::kStored);
  out += TimeoutsText(TimeoutsOf(db, Layer::kStored));

  out += "\nDistributed switch cache\n";
  DistributedSection(db, out, Layer::kStored);

  Section(out, "Opaque switches", OpaqueSwitches(db), OpaqueSwitchText);
  Section(out, "DVPorts", DVPorts(db), DVPortText);
  Section(out, "Events", Events(db), [](const std::string& event) { return event; });
  Section(out, "Faults", Faults(db), FaultText);
  return out;
}

std::string Show(Store::Db& db, const std::string& name) {
  Instrument::Scope scope(db, "Show");
  std::string out;
  for (const Layer layer : {Layer::kRunning, Layer::kStored}) {
    std::string part;
    if (const auto sw = FindStandardSwitch(db, layer, name)) part += StandardSwitchText(*sw);
    if (const auto group = FindPortGroup(db, layer, name)) {
      part += "  On standard switch " + group->row.switchName + ":\n" + PortGroupText(*group);
    }
    if (const auto dvs = FindDVSwitch(db, layer, name)) part += DVSwitchText(*dvs);
    if (!part.empty()) {
      out += layer == Layer::kRunning ? "Running state\n" : "Stored configuration\n";
      out += part;
    }
  }
  if (const auto opaque = FindOpaqueSwitch(db, name)) {
    out += "Opaque switch\n  " + OpaqueSwitchText(*opaque) + "\n";
  }
  if (const auto port = FindDVPort(db, name)) out += "DVPort\n  " + DVPortText(*port) + "\n";
  if (out.empty()) throw NothingNamed(name);
  return out;
}

}  // namespace TarnCtl::Admin
