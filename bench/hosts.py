"""Hosts for the benchmark, made with `tarnhost load` of generated dumps.

Every host has the free pnics pnic0..pnic3 and the switch SWITCH with
SWITCH_GROUPS port groups, the object that the one-object commands act on,
so that those commands see the same switch on every host; the host's other
port groups sit in further switches of up to GROUPS_PER_SWITCH each.
"""
import json
import os
import subprocess

from measure import check_exit

SWITCH = "bench0"
SWITCH_GROUPS = 10
GROUPS_PER_SWITCH = 100

SWITCH_POLICY = {"flags": 16, "balancing": 0, "failback": 0,
                 "linkCriteria": {"checkMask": 0, "minSpeed": 0, "errorPercent": 0, "fullDuplex": 0},
                 "uplinkOrder": [], "maxActive": 0}
GROUP_POLICY = dict(SWITCH_POLICY, flags=0)


def tarnhost(tarnhost_bin, env, *args):
    """The output of `tarnhost ARGS...`; what it says on stderr only when it fails."""
    argv = [tarnhost_bin, *args]
    proc = subprocess.run(argv, env=env, capture_output=True)
    check_exit(argv, proc)
    return proc.stdout


def switch_sizes(groups):
    """Port groups of each switch of a host of `groups` port groups."""
    sizes = [min(groups, SWITCH_GROUPS)]
    rest = groups - sizes[0]
    while rest > 0:
        sizes.append(min(rest, GROUPS_PER_SWITCH))
        rest -= sizes[-1]
    return sizes


def make_dump(empty_dump, groups):
    """`empty_dump` (a dump of an empty host) filled with a host of `groups`
    port groups, in both layers (stored and running)."""
    dump = json.loads(empty_dump)
    tables = dump["tables"]
    seq = 1
    tables["pnic"] = []
    for i in range(4):
        tables["pnic"].append({"seq": seq, "name": f"pnic{i}"})
        seq += 1
    switches, portgroups = [], []
    for s, size in enumerate(switch_sizes(groups)):
        sw = f"bench{s}"
        for layer in (0, 1):
            switches.append({"layer": layer, "name": sw, "seq": seq, "num_ports": 4096,
                             "mtu": 1500, "cdp": 1, "system": 0, "policy": SWITCH_POLICY})
        seq += 1
        for g in range(size):
            for layer in (0, 1):
                portgroups.append({"layer": layer, "name": f"{sw}-pg{g}", "switch": sw,
                                   "seq": seq, "vlan": g % 4096, "policy": GROUP_POLICY})
            seq += 1
    tables["vswitch"] = sorted(switches, key=lambda r: (r["layer"], r["name"]))
    tables["portgroup"] = sorted(portgroups, key=lambda r: (r["layer"], r["name"]))
    for row in tables["meta"]:
        if row["key"] == "next_seq":
            row["value"] = str(seq)
    return dump


def new_host(tarnhost_bin, home, *init):
    """The environment of a host made by `tarnhost init INIT...` in the new
    directory `home`."""
    os.makedirs(home)
    env = dict(os.environ, TARN_HOST_DB=os.path.join(home, "host.db"))
    env.pop("TARN_TRACE", None)
    tarnhost(tarnhost_bin, env, "init", *init)
    return env


def make_host(tarnhost_bin, home, groups):
    """The environment of a host of `groups` port groups in the new
    directory `home`."""
    env = new_host(tarnhost_bin, home, "--empty")
    dump = make_dump(tarnhost(tarnhost_bin, env, "dump"), groups)
    dump_path = os.path.join(home, "host.json")
    with open(dump_path, "w") as f:
        json.dump(dump, f)
    tarnhost(tarnhost_bin, env, "load", dump_path)
    os.unlink(dump_path)
    return env
