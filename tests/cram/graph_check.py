"""Checks a drawing of the host (`tarnhost show --dot | dot -Tjson`) against
the host (`tarnhost show --json`): every object is a node and every link an
edge, dashed when only the stored configuration has it, dotted when only the
running state has it, and nothing else is drawn. Prints each difference,
then what was compared.

Usage: graph_check.py HOST.json GRAPH.json"""
import json
import sys

host, graph = (json.load(open(path)) for path in sys.argv[1:3])
BOTH = {"running", "stored"}
want = {}  # node id or (tail, head) -> the layers that have it


def id_(kind, *names):
    return ":".join([kind] + [n.replace("%", "%25").replace(":", "%3A") for n in names])


def add(key, layers=BOTH):
    want.setdefault(key, set()).update(layers)


def clients(owner, kind, *names):
    for client in names[-1]:
        add(id_(kind, *names[:-1], client))
        add((id_(kind, *names[:-1], client), owner))


for pnic in host["pnics"]:
    add(id_("pnic", pnic))
for layer in BOTH:
    for sw in host[layer]["standardSwitches"]:
        vs = id_("vswitch", sw["name"])
        add(vs, {layer})
        for pnic in sw["uplinks"]:
            add((vs, id_("pnic", pnic)), {layer})
        for group in sw["portGroups"]:
            pg = id_("portgroup", group["name"])
            add(pg, {layer})
            add((pg, vs), {layer})
            clients(pg, "client", group["name"], group["clients"])
            own = group["teaming"]["uplinkOrder"] if group["teaming"]["uplinkOrderSet"] else []
            for pnic in set(own) & set(host["pnics"]):
                add((pg, id_("pnic", pnic)), {layer})
    for dvs in host[layer]["distributedSwitches"]:
        add(id_("dvswitch", dvs["name"]), {layer})
        for uplink in dvs["uplinks"]:
            add((id_("dvswitch", dvs["name"]), id_("pnic", uplink["pnic"])), {layer})
for port in host["dvports"]:
    dvport = id_("dvport", port["dvs"], port["portId"])
    add(id_("dvswitch", port["dvs"]), set())  # drawn as "in no layer" when no layer has it
    add(dvport)
    add((dvport, id_("dvswitch", port["dvs"])))
    clients(dvport, "dvclient", port["dvs"], port["portId"], port["clients"])
for sw in host["opaqueSwitches"]:
    add(id_("opaque", sw["name"]))
    for pnic in sw["uplinks"]:
        add((id_("opaque", sw["name"]), id_("pnic", pnic)))


def drawn(item):
    style = item.get("style", "")
    return "dashed" if "dashed" in style else "dotted" if "dotted" in style else "solid"


expected = {key: {frozenset({"stored"}): "dashed", frozenset({"running"}): "dotted"}.get(
    frozenset(layers), "solid") for key, layers in want.items()}
names = {o["_gvid"]: o["name"] for o in graph["objects"] if "nodes" not in o}
got = {o["name"]: drawn(o) for o in graph["objects"] if "nodes" not in o}
got.update({(names[e["tail"]], names[e["head"]]): drawn(e) for e in graph.get("edges", [])})
for key in sorted(set(got) | set(expected), key=str):
    if got.get(key) != expected.get(key):
        print(f"{key}: drawn {got.get(key, 'not at all')}, expected {expected.get(key, 'nothing')}")
print(f"{len(names)} nodes, {len(got) - len(names)} edges compared")
