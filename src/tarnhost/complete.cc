#include "tarnhost/complete.h"

#include <algorithm>

#include "tarnctl/admin/faults.h"
#include "tarnctl/admin/host.h"
#include "tarnctl/admin/listing.h"
#include "tarnctl/admin/snapshots.h"
#include "tarnhost/commands.h"
#include "tarnhost/table.h"

namespace TarnHost {

const std::vector<std::string>& FaultOperationNames() {
  static const std::vector<std::string> names = [] {
    std::vector<std::string> faultable;
    for (const auto& operation : TarnCtl::Admin::LibraryOperations()) {
      if (operation.faultable) faultable.push_back(operation.name);
    }
    return faultable;
  }();
  return names;
}

namespace {

using TarnCtl::Admin::ObjectKind;

// The kinds of the host's objects: what completes them, and their word for
// `tarnhost __names`.
struct HostKind {
  Kind kind;
  ObjectKind objects;
  const char* word;
};
constexpr HostKind kHostKinds[] = {
    {Kind::Pnic, ObjectKind::kPnic, "pnic"},
    {Kind::PnicList, ObjectKind::kFreePnic, "free-pnic"},
    {Kind::PortGroup, ObjectKind::kPortGroup, "portgroup"},
    {Kind::Client, ObjectKind::kClient, "client"},
    {Kind::Switch, ObjectKind::kSwitch, "switch"},
    {Kind::SystemSwitch, ObjectKind::kSystemSwitch, "system-switch"},
    {Kind::DVSwitch, ObjectKind::kDVSwitch, "dvs"},
    {Kind::DVPort, ObjectKind::kDVPort, "dvport"},
    {Kind::OpaqueSwitch, ObjectKind::kOpaqueSwitch, "opaque"},
    {Kind::Portset, ObjectKind::kPortset, "portset"},
    {Kind::Object, ObjectKind::kObject, "object"},
    {Kind::Showable, ObjectKind::kShowable, "showable"},
    {Kind::Fault, ObjectKind::kFault, "fault"},
};

// The words of `kind` that can stand where `given` (the arguments before)
// leads. Clients and DVPorts are those of the argument before them.
Words Candidates(Kind kind, const Words& given) {
  switch (kind) {
    case Kind::Command:
      return NextWords(given);
    case Kind::Operation:
      return FaultOperationNames();
    case Kind::Snapshot:
    case Kind::State:
      return TarnCtl::Admin::Snapshots(TarnCtl::Admin::HostPath());
    default:
      for (const auto& host : kHostKinds) {
        if (host.kind == kind) {
          return TarnCtl::Admin::PeekNames(host.objects, given.empty() ? "" : given.back());
        }
      }
      return {};
  }
}

int Offer(const char* what, const Words& candidates, const std::string& current,
          const std::string& before = "") {
  std::string text = std::string(what) + "\n";
  for (const auto& c : candidates) {
    // Options only where one is being typed, and only then.
    if (c.compare(0, current.size(), current) == 0 && (c[0] == '-') == (current[0] == '-')) {
      text += before + c + "\n";
    }
  }
  return Print(text);
}

// Offers the words of `kind` for `current`, after `before` ("--opt=").
// In a list of pnics, the last one is completed, and those listed already
// are not offered again.
int OfferValue(Kind kind, const Words& given, const std::string& current,
               const std::string& before = "") {
  Words candidates = Candidates(kind, given);
  const auto comma = current.rfind(',');
  if (kind != Kind::PnicList || comma == std::string::npos) {
    return Offer("words", candidates, current, before);
  }
  const std::string listed = current.substr(0, comma + 1);
  std::erase_if(candidates, [&](const std::string& pnic) {
    return ("," + listed).find("," + pnic + ",") != std::string::npos;
  });
  return Offer("words", candidates, current.substr(comma + 1), before + listed);
}

}  // namespace

int Names(const Args& args) {
  if (args.Positionals().empty()) throw UsageError("missing KIND");
  const std::string& word = args.Positional(0);
  Words words;
  for (const auto& host : kHostKinds) {
    if (word == host.word) {
      const Words names = TarnCtl::Admin::PeekNames(
          host.objects, args.Positionals().size() > 1 ? args.Positional(1) : "");
      return Print(names.empty() ? "" : Join(names, "\n") + "\n");
    }
    words.push_back(host.word);
  }
  throw UsageError("unknown kind " + word + " (" + Join(words, ", ") + ")");
}

int Complete(const Args& args) {
  if (args.Positionals().empty()) return Offer("words", {}, "");
  const Words& all = args.Positionals();
  const std::string& current = all.back();
  const Words before(all.begin(), all.end() - 1);
  size_t used = 0;
  const Command* command = Find(before, &used);
  if (!command) {
    return Offer("words", KnownPrefix(before) == before.size() ? NextWords(before) : Words{},
                 current);
  }
  // Where the current word stands: after an option that wants its value,
  // after "--", or at which argument.
  const Syntax& syntax = command->syntax;
  const Tokens tokens = Tokenize(Words(before.begin() + used, before.end()), syntax);
  const bool optionsEnded = syntax.raw || tokens.ended;
  const Words& given = tokens.rest ? *tokens.rest : tokens.arguments;
  Words options;
  for (const auto& option : tokens.options) options.push_back(option.word);
  if (!tokens.options.empty() && !optionsEnded) {
    const auto& last = tokens.options.back();
    if (last.def && last.def->TakesValue() && !last.value) {
      return OfferValue(last.def->kind, {}, current);
    }
  }
  if (!optionsEnded && current.compare(0, 2, "--") == 0 && current.find('=') != std::string::npos) {
    const std::string name = current.substr(0, current.find('='));
    const OptionDef* o = syntax.Option(name.substr(2));
    if (!o || !o->TakesValue()) return Offer("words", {}, current);
    return OfferValue(o->kind, {}, current.substr(name.size() + 1), name + "=");
  }
  if (!optionsEnded && !current.empty() && current[0] == '-') {
    Words names;
    for (const auto& o : syntax.options) {
      const std::string name = "--" + std::string(o.name);
      if (o.repeatable || std::find(options.begin(), options.end(), name) == options.end()) {
        names.push_back(name);
      }
    }
    return Offer("words", names, current);
  }
  const auto& defs = syntax.arguments;
  const ArgumentDef* def = given.size() < defs.size()             ? &defs[given.size()]
                           : !defs.empty() && defs.back().repeats ? &defs.back()
                                                                  : nullptr;
  // Files, which the shell finds, and the words that can stand for one.
  if (def && (def->kind == Kind::File || def->kind == Kind::State)) {
    return Offer("files", Candidates(def->kind, given), current);
  }
  if (!def) return Offer("words", {}, current);
  return OfferValue(def->kind, given, current);
}

}  // namespace TarnHost
