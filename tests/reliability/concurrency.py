#!/usr/bin/env python3
"""Many programs on one host at once.

Eight processes add port groups to vswitch0 while four link and unlink a
pnic each on vs1, each process reaching the host through one of three
names: the file, a symbolic link to it and a hard link to it (one host, one
lock). No run may fail; every added port group and each pnic's last link
state must be in both layers, and vs1's teaming order must hold its linked
pnics once each, all active (no policy update lost).

usage: concurrency.py BIN_DIR
"""
import os
import sys
import threading
import time

from common import Host, names

PG_WORKERS = 8
PGS_PER_WORKER = 100
LINK_WORKERS = 4


def main():
    bin_dir = sys.argv[1]
    host = Host(bin_dir, "concurrency.")
    tool, tarnhost, must = host.tool, host.tarnhost, host.must
    must(tarnhost, "init")
    must(tool, "-a", "vs1")
    pnics = [f"pnic{4 + w}" for w in range(LINK_WORKERS)]
    for pnic in pnics:
        must(tarnhost, "pnic", "add", pnic)

    # Three names of one host file.
    aliases = [host.db, os.path.join(host.work, "alias.db"), os.path.join(host.work, "hard.db")]
    os.symlink(host.db, aliases[1])
    os.link(host.db, aliases[2])

    runs = []  # (argv, returncode, stderr), appended by every worker
    lock = threading.Lock()
    adding = threading.Event()
    adding.set()

    def record(args, name):
        r = host.run_as(aliases[name % len(aliases)], *args)
        with lock:
            runs.append((args, r.returncode, r.stderr.strip()))
        return r.returncode

    def add_port_groups(w):
        for i in range(PGS_PER_WORKER):
            record((tool, "-A", f"pg{w}_{i}", "vswitch0"), w + i)

    last_linked = {}  # pnic -> state after its last command that exited 0

    def link_and_unlink(w):
        pnic = pnics[w]
        linked = False
        # Keep going while port groups are added; odd workers end linked.
        while adding.is_set() or linked != (w % 2 == 1):
            op = "-U" if linked else "-L"
            if record((tool, op, pnic, "vs1"), w) != 0:
                return  # counted as a failure; retrying would only hide it
            linked = not linked
            last_linked[pnic] = linked

    start = time.monotonic()
    adders = [threading.Thread(target=add_port_groups, args=(w,)) for w in range(PG_WORKERS)]
    linkers = [threading.Thread(target=link_and_unlink, args=(w,)) for w in range(LINK_WORKERS)]
    for t in adders + linkers:
        t.start()
    for t in adders:
        t.join()
    adding.clear()
    for t in linkers:
        t.join()
    elapsed = time.monotonic() - start

    failures = []
    failed = [(a, rc, err) for a, rc, err in runs if rc != 0]
    for args, rc, err in failed[:10]:
        failures.append(f"{' '.join(args[1:])} exited {rc}: {err}")
    busy = sum(1 for _, _, err in runs if "busy" in err)
    if busy:
        failures.append(f"{busy} runs failed because the host was busy")

    tables = host.dump()["tables"]
    for layer in (0, 1):
        present = names(tables["portgroup"], layer)
        added = {a[2] for a, rc, _ in runs if a[1] == "-A" and rc == 0}
        missing = sorted(added - present)
        if missing:
            failures.append(f"layer {layer}: {len(missing)} added port groups missing: {missing[:5]}")
        links = {r["pnic"] for r in tables["link"] if r["layer"] == layer and r["switch"] == "vs1"}
        expected = {p for p, linked in last_linked.items() if linked}
        if links != expected:
            failures.append(f"layer {layer}: vs1 linked to {sorted(links)}, expected {sorted(expected)}")
        (vs1,) = [r for r in tables["vswitch"] if r["layer"] == layer and r["name"] == "vs1"]
        order, active = vs1["policy"]["uplinkOrder"], vs1["policy"]["maxActive"]
        if sorted(order) != sorted(expected) or active != len(order):
            failures.append(f"layer {layer}: vs1 order {order} with {active} active, "
                            f"expected {sorted(expected)} all active")

    adds = sum(1 for a, _, _ in runs if a[1] == "-A")
    host.finish(f"{len(runs)} runs ({adds} port group adds, {len(runs) - adds} links and "
                f"unlinks) in {elapsed:.1f} s; {len(failed)} failed", failures)


if __name__ == "__main__":
    main()
