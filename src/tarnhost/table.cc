#include "tarnhost/table.h"

#include <algorithm>

#include "tarnctl/admin/snapshots.h"
#include "tarnctl/model/limits.h"
#include "tarnctl/model/names.h"
#include "tarnhost/commands.h"
#include "tarnhost/complete.h"
#include "tarnhost/help.h"

namespace TarnHost {
namespace {

using TarnCtl::Admin::Listing;

// Options that several commands share.
const OptionDef kPorts{
    .name = "ports", .value = "N", .help = "number of ports (default 128)", .kind = Kind::Number};
const OptionDef kPortset{.name = "portset", .value = "NAME", .help = "portset name (default NAME)"};
const OptionDef kUplinks{.name = "uplinks",
                         .value = "A,B,...",
                         .help = "uplinks: pnics that no switch uses",
                         .kind = Kind::PnicList};

#define LIST_FORM \
  " Fields are separated by a tab and lists within a field by commas; an empty field is none."

// Ranges and name lengths as the host's rules have them.
std::string Span(const TarnCtl::Model::Range& range) {
  return std::to_string(range.min) + " to " + std::to_string(range.max);
}
std::string Bytes(TarnCtl::Model::NameKind kind) {
  return "1 to " + std::to_string(TarnCtl::Model::RuleOf(kind).maxBytes) + " bytes";
}

const std::string kTimeoutRules = "The timeout is " + Span(TarnCtl::Model::kTimeout) +
                                  " and the portset " + Bytes(TarnCtl::Model::NameKind::kPortset) +
                                  "; the portset need not exist yet, and a record with the same "
                                  "key must not be stored already.";

bool StartsWith(const Words& words, const Words& prefix) {
  return words.size() >= prefix.size() && std::equal(prefix.begin(), prefix.end(), words.begin());
}

// Its words first, then its other spellings.
std::vector<Words> Spellings(const Command& c) {
  std::vector<Words> all{c.words};
  all.insert(all.end(), c.also.begin(), c.also.end());
  return all;
}

}  // namespace

std::string Command::Name() const {
  return Join(words, " ");
}

const std::vector<Command>& Commands() {
  static const std::vector<Command> commands = {
      {.words = {"init"},
       .syntax = {.options = {{.name = "empty", .help = "a host with nothing at all"}}},
       .summary = "reset the host to the default host, or to an empty one",
       .help = "The default host has the pnics pnic0 to pnic3 and the standard switch vswitch0, "
               "linked to pnic0, with its port group Management.",
       .run = Init},
      {.words = {"show"},
       .syntax = {.arguments = {{"NAME", Kind::Showable, true}},
                  .options = {{.name = "json",
                               .help = "as JSON; with NAME, only what has that name"},
                              {.name = "dot", .help = "as a Graphviz graph"}}},
       .summary = "print the host in readable form, as JSON or as a graph",
       .help = "Prints the host file, the pnics, the running state, the stored configuration, "
               "the distributed switch cache, opaque switches, DVPorts, events and armed faults. "
               "docs/host.md describes the JSON; 'tarnhost show --dot | dot -Tsvg > host.svg' "
               "draws the graph. NAME shows one switch (of any kind), port group or DVPort "
               "(DVS:PORTID), in both layers.",
       .run = Show},
      {.words = {"dump"},
       .summary = "write the whole host as JSON on standard output",
       .help = "A dump of a loaded dump is the same text.",
       .run = Dump},
      {.words = {"load"},
       .syntax = {.arguments = {{"FILE", Kind::File}}},
       .summary = "replace the host with a dump (FILE - : standard input)",
       .help = "The document is checked first: a malformed or inconsistent dump is refused as a "
               "whole and the host stays as it was.",
       .run = Load},
      {.words = {"diff"},
       .syntax = {.arguments = {{"A", Kind::State, true}, {"B", Kind::State, true}},
                  .options = {{.name = "layers",
                               .help = "the stored configuration against the running state"},
                              {.name = "json", .help = "as a JSON array of records"}}},
       .summary = "print how two states of the host differ, object by object",
       .help = "A and B are each a snapshot's name or a dump file (- : standard input); A alone "
               "is compared with the host. A line for each changed field, naming the object and "
               "the layers it changed in: 'portgroup Test [running, stored]: vlan 43 -> 100'; "
               "'+ KIND NAME' for an object that came, '- KIND NAME' for one that went; objects "
               "in creation order. --layers compares the host's stored configuration with its "
               "running state: what a reboot would lose and a restore bring back. --json prints "
               "records of kind, name, layer, field, from and to.\nExit status as diff's: 0 "
               "equal, 1 different, 2 trouble.",
       .run = Diff},
      {.words = {"snapshot", "save"},
       .syntax = {.arguments = {{"NAME", Kind::Snapshot}}},
       .summary = "keep the whole host as a snapshot named NAME",
       .help = "Replaces a snapshot of that name. Snapshots are files in the folder PATH.snapshots "
               "beside the host file PATH; a snapshot holds every table of the host, its faults "
               "and events too. NAME is 1 to " +
               std::to_string(TarnCtl::Admin::kSnapshotNameMax) +
               " bytes, without '/' or a control character, and "
               "does not start with '.'.",
       .run = SaveSnapshot},
      {.words = {"snapshot", "restore"},
       .syntax = {.arguments = {{"NAME", Kind::Snapshot}}},
       .summary = "replace the host with a snapshot",
       .help = "In one commit: faults and events become the snapshot's too. A damaged snapshot, "
               "or one of another version, is refused and the host left as it was.",
       .run = RestoreSnapshot},
      {.words = {"snapshot", "list"},
       .summary = "list the snapshots of the host",
       .help = "Their names, a line each, in byte order.",
       .run = ListSnapshots},
      {.words = {"snapshot", "del"},
       .syntax = {.arguments = {{"NAME", Kind::Snapshot}}},
       .summary = "remove a snapshot",
       .run = RemoveSnapshot},
      {.words = {"try"},
       .syntax = {.arguments = {{"COMMAND"}, {"ARGS", Kind::Text, true, true}},
                  .options = {{.name = "json", .help = "the differences as JSON"},
                              {.name = "trace", .help = "then the calls COMMAND made"}},
                  .rest = true},
       .summary = "run a command on a copy of the host and print what it changed",
       .help = "Runs COMMAND with TARN_HOST_DB naming a private copy of the host, then prints how "
               "the copy differs from the host, as 'tarnhost diff' does; the host is not changed "
               "and the copy is removed. With --trace, the call trace of the run follows (with "
               "--json: an object of \"diff\" and \"trace\", its lines). Exit status: "
               "COMMAND's.",
       .run = Try},
      {.words = {"reboot"},
       .summary = "drop the running state, keep the stored configuration",
       .help = "As a restart of the host would.",
       .run = Reboot},
      {.words = {"path"},
       .summary = "print the path of the host file",
       .help = "The file named by TARN_HOST_DB, or when that is unset or empty, the default "
               "location for this user. A missing file is created holding the default host by "
               "the first command that opens the host.",
       .run = Path},
      {.words = {"pnic", "add"},
       .syntax = {.arguments = {{"NAME"}}},
       .summary = "add a physical NIC",
       .help = "Its name is " + Bytes(TarnCtl::Model::NameKind::kPnic) + " and unique.",
       .run = AddPnic},
      {.words = {"pnic", "del"},
       .syntax = {.arguments = {{"NAME", Kind::Pnic}}},
       .summary = "remove a physical NIC",
       .help = "Refused while a switch of the running state uses it, and while the stored "
               "configuration or the distributed switch cache links it: a restore would link it "
               "again.",
       .run = RemovePnic},
      {.words = {"pnic", "list"},
       .summary = "list the physical NICs",
       .help = "A line for each: its name, the running switch that uses it, and the switch that "
               "links it in the stored configuration or the cache." LIST_FORM,
       .run = List<Listing::kPnics>},
      {.words = {"client", "add"},
       .syntax = {.arguments = {{"PORTGROUP", Kind::PortGroup}, {"CLIENT"}}},
       .summary = "connect a client to a port group",
       .help = "The port group is one of the running state; the client takes one port of its "
               "switch. Client names are " +
               Bytes(TarnCtl::Model::NameKind::kClient) + ", unique on their port group.",
       .run = AddClient},
      {.words = {"client", "del"},
       .syntax = {.arguments = {{"PORTGROUP", Kind::PortGroup}, {"CLIENT", Kind::Client}}},
       .summary = "disconnect a client from a port group",
       .help = "The port group need not exist: a client waits for a port group of its name.",
       .run = RemoveClient},
      {.words = {"client", "list"},
       .syntax = {.arguments = {{"PORTGROUP", Kind::PortGroup, true}}},
       .summary = "list the clients of port groups",
       .help = "A line for each: its port group and its name; those of PORTGROUP only when "
               "given." LIST_FORM,
       .run = List<Listing::kClients>},
      {.words = {"system-switch", "add"},
       .syntax = {.arguments = {{"NAME"}}, .options = {kPorts}},
       .summary = "add a system switch",
       .help = "It has MTU 1500, CDP listen and an empty uplink order, in both layers; "
               "orvocfg-vswitch lists it with -l -S only.",
       .run = AddSystemSwitch},
      {.words = {"system-switch", "del"},
       .syntax = {.arguments = {{"NAME", Kind::SystemSwitch}}},
       .summary = "remove a system switch",
       .help = "From both layers, with its port groups and links; refused while its port groups "
               "have clients, as the library refuses a standard switch.",
       .run = RemoveSystemSwitch},
      {.words = {"system-switch", "list"},
       .summary = "list the system switches",
       .help = "A line for each of the running state: its name, ports, used ports and "
               "uplinks." LIST_FORM,
       .run = List<Listing::kSystemSwitches>},
      {.words = {"dvs", "add"},
       .syntax = {.arguments = {{"NAME"}},
                  .options = {kPortset,
                              {.name = "id", .value = "ID", .help = "switch id (default dvs-NAME)"},
                              kPorts,
                              {.name = "mtu",
                               .value = "N",
                               .help = "MTU, " + Span(TarnCtl::Model::kMtu) + " (default " +
                                       std::to_string(TarnCtl::Model::kDefaultMtu) + ")",
                               .kind = Kind::Number},
                              kUplinks}},
       .summary = "add a distributed switch",
       .help = "Adds it to the running state and the distributed switch cache. Its names and "
               "switch id must not be used by any switch.",
       .run = AddDVSwitch},
      {.words = {"dvs", "del"},
       .syntax = {.arguments = {{"NAME", Kind::DVSwitch}}},
       .summary = "remove a distributed switch",
       .help = "From the running state and the cache, with its uplinks and DVPorts; refused "
               "while a DVPort has a client, as the library refuses it.",
       .run = RemoveDVSwitch},
      {.words = {"dvs", "list"},
       .summary = "list the distributed switches",
       .help = "A line for each of the running state: its name, portset, switch id, ports, used "
               "ports and uplinks." LIST_FORM,
       .run = List<Listing::kDVSwitches>},
      {.words = {"dvport", "add"},
       .syntax = {.arguments = {{"DVS", Kind::DVSwitch}, {"PORTID"}},
                  .options = {{.name = "client",
                               .value = "NAME",
                               .repeatable = true,
                               .help = "a client of the port, once for each"},
                              {.name = "connection-id",
                               .value = "N",
                               .help = "connection id (default 0)",
                               .kind = Kind::Number}}},
       .summary = "add a DVPort to a distributed switch",
       .help = "A switch holds at most its number of ports of DVPorts.",
       .run = AddDVPort},
      {.words = {"dvport", "del"},
       .syntax = {.arguments = {{"DVS", Kind::DVSwitch}, {"PORTID", Kind::DVPort}}},
       .summary = "remove a DVPort",
       .help = "Refused while it has clients or holds an uplink.",
       .run = RemoveDVPort},
      {.words = {"dvport", "list"},
       .syntax = {.arguments = {{"DVS", Kind::DVSwitch, true}}},
       .summary = "list the DVPorts",
       .help = "A line for each: its switch, port id, connection id, the uplinks added to it, "
               "then a field for each client; those of DVS only when given." LIST_FORM,
       .run = List<Listing::kDVPorts>},
      {.words = {"opaque", "add"},
       .syntax = {.arguments = {{"NAME"}},
                  .options = {kPortset,
                              kPorts,
                              {.name = "used",
                               .value = "N",
                               .help = "ports in use, at most --ports (default 0)",
                               .kind = Kind::Number},
                              kUplinks}},
       .summary = "add an opaque switch",
       .help = "orvocfg-vswitch lists it but cannot change it.",
       .run = AddOpaque},
      {.words = {"opaque", "del"},
       .syntax = {.arguments = {{"NAME", Kind::OpaqueSwitch}}},
       .summary = "remove an opaque switch",
       .help = "Its control plane may; orvocfg-vswitch cannot.",
       .run = RemoveOpaque},
      {.words = {"opaque", "list"},
       .summary = "list the opaque switches",
       .help = "A line for each: its name, portset, ports, used ports and uplinks." LIST_FORM,
       .run = List<Listing::kOpaqueSwitches>},
      {.words = {"timeout", "add", "uplink"},
       .also = {{"timeout", "uplink"}},
       .syntax = {.arguments = {{"PORTSET", Kind::Portset},
                                {"UPLINK", Kind::Pnic},
                                {"LAGID", Kind::Number},
                                {"TIMEOUT", Kind::Number}}},
       .summary = "store an uplink timeout record",
       .help = "orvocfg-vswitch -O loads the matching records. " + kTimeoutRules,
       .run = AddUplinkTimeout},
      {.words = {"timeout", "add", "lag"},
       .also = {{"timeout", "lag"}},
       .syntax = {.arguments = {{"PORTSET", Kind::Portset},
                                {"LAGID", Kind::Number},
                                {"TIMEOUT", Kind::Number}}},
       .summary = "store a LAG timeout record",
       .help = "orvocfg-vswitch -G loads the matching records. " + kTimeoutRules,
       .run = AddLagTimeout},
      {.words = {"timeout", "del", "uplink"},
       .syntax = {.arguments = {{"PORTSET", Kind::Portset},
                                {"UPLINK", Kind::Pnic},
                                {"LAGID", Kind::Number}}},
       .summary = "remove a stored uplink timeout record",
       .help = "Records loaded into the running state stay until the next load.",
       .run = RemoveUplinkTimeout},
      {.words = {"timeout", "del", "lag"},
       .syntax = {.arguments = {{"PORTSET", Kind::Portset}, {"LAGID", Kind::Number}}},
       .summary = "remove a stored LAG timeout record",
       .help = "Records loaded into the running state stay until the next load.",
       .run = RemoveLagTimeout},
      {.words = {"timeout", "list"},
       .summary = "list the stored timeout records",
       .help = "A line for each, uplink records first: uplink or lag, its portset, uplink (empty "
               "for a LAG record), LAG id and timeout." LIST_FORM,
       .run = List<Listing::kTimeouts>},
      {.words = {"fault", "add"},
       .syntax = {.arguments = {{"OPERATION", Kind::Operation}},
                  .options = {{.name = "on",
                               .value = "NAME",
                               .help = "only calls on the object of that name, or given that name",
                               .kind = Kind::Object},
                              {.name = "message",
                               .value = "TEXT",
                               .help = "the exception's message (default: injected fault)"},
                              {.name = "detail",
                               .value = "TEXT",
                               .help = "its detailed message (default: injected fault in "
                                       "OPERATION)"},
                              {.name = "skip",
                               .value = "K",
                               .help = "let K matching calls pass first (default 0)",
                               .kind = Kind::Number},
                              {.name = "times",
                               .value = "N",
                               .help = "fail N calls (default 1)",
                               .kind = Kind::Number},
                              {.name = "always", .help = "fail every matching call, not N"},
                              {.name = "delay",
                               .value = "MS",
                               .help = "wait MS milliseconds before the call fails (default 0)",
                               .kind = Kind::Number},
                              {.name = "pass",
                               .help = "let the call go on normally after the wait: a slow "
                                       "host"}}},
       .summary = "make a library operation fail",
       .help = "OPERATION is named as in the host control interface (SetVlanId, AddUplink, ...); "
               "its next matching calls throw. NODI_CheckSig fails by returning a non-zero "
               "status and GetIntParamList by returning no list. Faults are used up across "
               "runs; one used up stays listed as spent, with the calls it fired on, until it "
               "is removed.",
       .run = AddFault},
      {.words = {"fault", "del"},
       .syntax = {.arguments = {{"NUMBER", Kind::Fault}}},
       .summary = "remove an armed fault",
       .help = "NUMBER is the one 'tarnhost fault list' shows; a fault keeps it while armed.",
       .run = RemoveFault},
      {.words = {"fault", "list"},
       .syntax = {.options = {{.name = "armed", .help = "only the faults not spent"}}},
       .summary = "list the faults",
       .help = "A line for each, in the order they are tried: its number, operation, the object "
               "of --on, the calls still to let pass and to fail, the message and the detailed "
               "message (quoted and escaped as in the call trace), the delay in ms, pass when "
               "the call goes on after it, always when every call fails, the calls it fired on, "
               "and armed or spent." LIST_FORM,
       .run = List<Listing::kFaults>},
      {.words = {"fault", "clear"}, .summary = "remove every armed fault", .run = ClearFaults},
      {.words = {"fault", "ops"},
       .summary = "list the library's operations",
       .help = "A line for each, by name: its name, yes when a fault can make it fail (no: it "
               "runs without the host), and what --on names for it." LIST_FORM,
       .run = ListOperations},
      {.words = {"help"},
       .also = {{"-h"}, {"--help"}},
       .syntax = {.arguments = {{"COMMAND", Kind::Command, true, true}}},
       .summary = "print this text, or the help of COMMAND",
       .help = "-h or --help after a command's words prints the same help.",
       .run = Help},
      {.words = {"--version"}, .summary = "print tarnhost's version", .run = Version},
      {.words = {"__complete"},
       .syntax = {.arguments = {{"WORD", Kind::Text, true, true}}, .raw = true},
       .summary = "complete the last WORD of a command line, for the shell",
       .help = "Prints what the word is (files or words), then the words that fit, one a line.",
       .run = Complete,
       .hidden = true},
      {.words = {"__names"},
       .syntax = {.arguments = {{"KIND"}, {"OWNER", Kind::Text, true}}, .raw = true},
       .summary = "print the names of the host's objects of a kind, for the shell",
       .help = "KIND names a kind of object (pnic, portgroup, switch, ...; an unknown one is "
               "refused naming them all); OWNER, the port group of clients or the switch of "
               "DVPorts. Prints nothing when the host is busy or missing.",
       .run = Names,
       .hidden = true},
  };
  return commands;
}

const Command* Find(const Words& words, size_t* used) {
  const Command* found = nullptr;
  *used = 0;
  for (const auto& c : Commands()) {
    for (const auto& spelling : Spellings(c)) {
      if (spelling.size() > *used && StartsWith(words, spelling)) {
        found = &c;
        *used = spelling.size();
      }
    }
  }
  return found;
}

std::vector<const Command*> Select(const Words& prefix) {
  std::vector<const Command*> listed, hidden;
  for (const auto& c : Commands()) {
    const auto spellings = Spellings(c);
    if (std::none_of(spellings.begin(), spellings.end(),
                     [&](const Words& s) { return StartsWith(s, prefix); })) {
      continue;
    }
    (c.hidden ? hidden : listed).push_back(&c);
  }
  return listed.empty() ? hidden : listed;
}

Words NextWords(const Words& prefix) {
  Words next;
  for (const auto& c : Commands()) {
    if (c.hidden || c.words.size() <= prefix.size() || !StartsWith(c.words, prefix)) continue;
    const std::string& word = c.words[prefix.size()];
    if (std::find(next.begin(), next.end(), word) == next.end()) next.push_back(word);
  }
  return next;
}

size_t KnownPrefix(const Words& words) {
  size_t known = 0;
  while (known < words.size()) {
    const Words next = NextWords(Words(words.begin(), words.begin() + known));
    if (std::find(next.begin(), next.end(), words[known]) == next.end()) break;
    ++known;
  }
  return known;
}

[[noreturn]] void Explain(const Words& words) {
  const size_t known = KnownPrefix(words);
  const Words prefix(words.begin(), words.begin() + known);
  const Words next = NextWords(prefix);
  const std::string before = known == 0 ? "" : Join(prefix, " ") + " ";
  if (known == words.size()) {
    throw CommandError(std::string("missing ") + (known == 1 ? "verb" : "word") + " after " +
                           before + "(" + Join(next, ", ") + ")",
                       Select(prefix));
  }
  const std::string& word = words[known];
  const bool option = known == 0 && IsOptionWord(word);
  throw CommandError((option ? "unknown option " : "unknown command: ") + before + word +
                         DidYouMean(word, next, before),
                     known == 0 ? std::vector<const Command*>{} : Select(prefix));
}

std::vector<const Command*> SelectOrExplain(const Words& prefix) {
  auto selected = Select(prefix);
  if (selected.empty()) Explain(prefix);
  return selected;
}

}  // namespace TarnHost
