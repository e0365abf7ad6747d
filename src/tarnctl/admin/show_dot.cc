// The host as a Graphviz graph, drawn from the JSON view (show_json.h):
// clients on the left, then port groups and DVPorts, switches, and the
// pnics on the right.
//
// Node ids are the object's kind and names, "kind:name[:name...]", each
// name with '%' and ':' written as %25 and %3A: "pnic:pnic0",
// "vswitch:vswitch0", "portgroup:Management", "client:Management:vm1",
// "dvswitch:dvs0", "dvport:dvs0:100", "dvclient:dvs0:100:vm2",
// "opaque:overlay0". Objects and links of both layers (and those that are
// not layered) are drawn solid, those of the stored configuration only
// dashed, those of the running state only dotted; where the layers differ
// in a line of a label, the stored value follows in brackets. An uplink's
// label is its place in the failover order ("#1 active", "#2 standby",
// "not in order"); active ones are bold; a port group's own order is drawn
// in blue from the port group.
#include <map>
#include <string>
#include <vector>

#include "hostctl/join.h"
#include "tarnctl/admin/show_json.h"
#include "tarnctl/admin/whole_host.h"

namespace TarnCtl::Admin {
namespace {

using HostCtl::Text::Join;
using Store::Json;

constexpr const char* kLayerKeys[] = {"running", "stored"};

enum Presence { kRunning = 1, kStored = 2, kBoth = 3 };

Presence PresenceOf(const std::string& layerKey) {
  return layerKey == "running" ? kRunning : kStored;
}

std::string Id(const char* kind, std::initializer_list<std::string> names) {
  std::string id = kind;
  for (const auto& name : names) {
    id += ':';
    for (const char c : name) {
      if (c == '%') {
        id += "%25";
      } else if (c == ':') {
        id += "%3A";
      } else {
        id += c;
      }
    }
  }
  return id;
}

// A quoted string of the dot language; a newline is a line break of a label.
std::string Quote(const std::string& text) {
  std::string out = "\"";
  for (const char c : text) {
    if (c == '"' || c == '\\') out += '\\';
    out += c == '\n' ? std::string("\\n") : std::string(1, c);
  }
  return out + "\"";
}

std::vector<std::string> Lines(const std::string& text) {
  std::vector<std::string> lines;
  size_t from = 0;
  for (size_t at; (at = text.find('\n', from)) != std::string::npos; from = at + 1) {
    lines.push_back(text.substr(from, at - from));
  }
  lines.push_back(text.substr(from));
  return lines;
}

// Nodes and edges met in either layer, merged by id, in the order first met.
class Graph {
 public:
  // `style`: the node's own style words, besides the layer's.
  void Node(const std::string& id, Presence in, const std::string& label, const std::string& attrs,
            const std::string& style = "") {
    Add(Quote(id), in, label, attrs, style);
  }
  void Edge(const std::string& from, const std::string& to, Presence in, const std::string& label,
            const std::string& attrs = "") {
    Add(Quote(from) + " -> " + Quote(to), in, label, attrs, "");
  }
  bool Has(const std::string& id) const { return items_.count(Quote(id)) > 0; }

  std::string Text() const {
    std::string out;
    for (const auto& key : order_) {
      const Item& item = items_.at(key);
      std::string attrs = item.attrs, style = item.style;
      if (item.in != kBoth) {
        style += std::string(style.empty() ? "" : ",") + (item.in == kStored ? "dashed" : "dotted");
      }
      if (!style.empty()) attrs += std::string(attrs.empty() ? "" : ", ") + "style=" + Quote(style);
      const std::string label = Label(item);
      if (!label.empty()) attrs = "label=" + Quote(label) + (attrs.empty() ? "" : ", " + attrs);
      out += "  " + key + (attrs.empty() ? "" : " [" + attrs + "]") + ";\n";
    }
    return out;
  }

 private:
  struct Item {
    Presence in;
    std::map<int, std::string> labels;  // by Presence
    std::string attrs;
    std::string style;
  };

  void Add(const std::string& key, Presence in, const std::string& label, const std::string& attrs,
           const std::string& style) {
    auto [it, added] = items_.try_emplace(key, Item{in, {}, attrs, style});
    if (added) {
      order_.push_back(key);
    } else {
      it->second.in = static_cast<Presence>(it->second.in | in);
    }
    it->second.labels.try_emplace(in, label);
  }

  // The running label, each line that the stored label has otherwise
  // followed by the stored one in brackets.
  static std::string Label(const Item& item) {
    const auto running = item.labels.find(kRunning), stored = item.labels.find(kStored);
    if (running == item.labels.end() || stored == item.labels.end()) {
      return item.labels.begin()->second;
    }
    const auto a = Lines(running->second), b = Lines(stored->second);
    std::vector<std::string> lines;
    for (size_t i = 0; i < std::max(a.size(), b.size()); ++i) {
      const std::string mine = i < a.size() ? a[i] : "";
      std::string line = mine;
      if (i >= a.size() || i >= b.size() || a[i] != b[i]) {
        line += (mine.empty() ? "" : " ") + ("(stored: " + (i < b.size() ? b[i] : "none") + ")");
      }
      lines.push_back(line);
    }
    return Join(lines, "\n");
  }

  std::map<std::string, Item> items_;
  std::vector<std::string> order_;
};

constexpr const char* kClient = "shape=plaintext";
constexpr const char* kSwitch = "shape=box";

// The uplink's place in the failover order of `teaming`, and how it is drawn.
std::pair<std::string, std::string> Role(const Json& teaming, const std::string& pnic) {
  const Json& order = teaming["uplinkOrder"];
  const int64_t active = teaming["maxActive"].get<int64_t>();
  for (size_t i = 0; i < order.size(); ++i) {
    if (order[i] != pnic) continue;
    const bool isActive = static_cast<int64_t>(i) < active;
    return {"#" + std::to_string(i + 1) + (isActive ? " active" : " standby"),
            isActive ? "penwidth=2" : ""};
  }
  return {"not in order", "color=gray50"};
}

void StandardSwitch(Graph& g, Presence in, const Json& sw) {
  const std::string id = Id("vswitch", {sw["name"]});
  g.Node(id, in,
         sw["name"].get<std::string>() + "\nstandard" +
             (sw["system"].get<bool>() ? ", system" : "") + "\n" +
             std::to_string(sw["ports"].get<int64_t>()) + " ports, MTU " +
             std::to_string(sw["mtu"].get<int64_t>()) + ", CDP " + sw["cdp"].get<std::string>(),
         kSwitch, "rounded");
  for (const auto& pnic : sw["uplinks"]) {
    const auto [label, attrs] = Role(sw["teaming"], pnic);
    g.Edge(id, Id("pnic", {pnic}), in, label, attrs);
  }
  for (const auto& group : sw["portGroups"]) {
    const std::string pg = Id("portgroup", {group["name"]});
    g.Node(pg, in, group["name"].get<std::string>() + "\nVLAN " + group["vlan"].dump(),
           "shape=ellipse");
    g.Edge(pg, id, in, "");
    for (const auto& client : group["clients"]) {
      const std::string c = Id("client", {group["name"], client});
      g.Node(c, kBoth, client, kClient);
      g.Edge(c, pg, kBoth, "");
    }
    if (!group["teaming"]["uplinkOrderSet"].get<bool>()) continue;
    for (const auto& pnic : group["teaming"]["uplinkOrder"]) {
      if (!pnic.is_string() || !g.Has(Id("pnic", {pnic}))) continue;
      const auto [label, attrs] = Role(group["teaming"], pnic);
      g.Edge(pg, Id("pnic", {pnic}), in, label,
             "color=blue, fontcolor=blue" + (attrs.empty() ? "" : ", " + attrs));
    }
  }
}

void DistributedSwitch(Graph& g, Presence in, const Json& dvs) {
  const std::string id = Id("dvswitch", {dvs["name"]});
  g.Node(id, in,
         dvs["name"].get<std::string>() + "\ndistributed, portset " +
             dvs["portset"].get<std::string>() + "\nid " + dvs["switchId"].get<std::string>() +
             "\n" + std::to_string(dvs["ports"].get<int64_t>()) + " ports, MTU " +
             std::to_string(dvs["mtu"].get<int64_t>()),
         std::string(kSwitch) + ", peripheries=2", "rounded");
  for (const auto& uplink : dvs["uplinks"]) {
    g.Edge(id, Id("pnic", {uplink["pnic"]}), in,
           uplink["dvport"].is_null() ? "" : "DVPort " + uplink["dvport"].get<std::string>());
  }
}

void DVPort(Graph& g, const Json& port) {
  const std::string dvs = Id("dvswitch", {port["dvs"]});
  if (!g.Has(dvs)) {
    g.Node(dvs, kBoth, port["dvs"].get<std::string>() + "\n(in no layer)",
           std::string(kSwitch) + ", color=gray50, fontcolor=gray50", "rounded");
  }
  const std::string id = Id("dvport", {port["dvs"], port["portId"]});
  g.Node(
      id, kBoth,
      "DVPort " + port["portId"].get<std::string>() + "\nconnection " + port["connectionId"].dump(),
      "shape=hexagon");
  g.Edge(id, dvs, kBoth, "");
  for (const auto& client : port["clients"]) {
    const std::string c = Id("dvclient", {port["dvs"], port["portId"], client});
    g.Node(c, kBoth, client, kClient);
    g.Edge(c, id, kBoth, "");
  }
}

void Opaque(Graph& g, const Json& sw) {
  const std::string id = Id("opaque", {sw["name"]});
  g.Node(id, kBoth,
         sw["name"].get<std::string>() + "\nopaque, portset " + sw["portset"].get<std::string>() +
             "\n" + sw["usedPorts"].dump() + " of " + sw["ports"].dump() + " ports used",
         "shape=box3d");
  for (const auto& pnic : sw["uplinks"]) g.Edge(id, Id("pnic", {pnic}), kBoth, "");
}

}  // namespace

std::string ShowDot(Store::Db& db) {
  const Json host = View::WholeHost(db);
  Graph g;
  std::string pnics;
  for (const auto& pnic : host["pnics"]) {
    g.Node(Id("pnic", {pnic}), kBoth, pnic, "shape=box");
    pnics += " " + Quote(Id("pnic", {pnic})) + ";";
  }
  for (const char* layer : kLayerKeys) {
    for (const auto& sw : host[layer]["standardSwitches"]) StandardSwitch(g, PresenceOf(layer), sw);
    for (const auto& dvs : host[layer]["distributedSwitches"]) {
      DistributedSwitch(g, PresenceOf(layer), dvs);
    }
  }
  for (const auto& port : host["dvports"]) DVPort(g, port);
  for (const auto& sw : host["opaqueSwitches"]) Opaque(g, sw);
  return "digraph host {\n"
         "  graph [rankdir=LR, fontname=Helvetica, fontsize=10, labelloc=b, label=" +
         Quote(
             "solid: in both layers; dashed: stored configuration only; dotted: running state "
             "only\nuplinks: place in the failover order, bold when active; blue: a port "
             "group's own order") +
         "];\n"
         "  node [fontname=Helvetica, fontsize=10];\n"
         "  edge [fontname=Helvetica, fontsize=9];\n"
         "  {rank=sink;" +
         pnics + "}\n" + g.Text() + "}\n";
}

}  // namespace TarnCtl::Admin
