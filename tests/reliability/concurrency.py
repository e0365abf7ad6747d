#!/usr/bin/env python3
"""Many programs on one host at once.

Eight processes add 100 port groups each to vswitch0 while four others link
and unlink a pnic each on vs1, all through orvocfg-vswitch. Checks:
  - no run failed, and none because the host was busy;
  - every port group whose command exited 0 is in both layers;
  - vs1's links in both layers are those of each pnic's last command;
  - vs1's teaming order holds exactly its linked pnics, each once, all of
    them active (no read-modify-write of the policy got lost).

usage: concurrency.py BIN_DIR
"""
import json
import os
import shutil
import subprocess
import sys
import tempfile
import threading
import time

PG_WORKERS = 8
PGS_PER_WORKER = 100
LINK_WORKERS = 4


def main():
    bin_dir = sys.argv[1]
    tool = os.path.join(bin_dir, "orvocfg-vswitch")
    tarnhost = os.path.join(bin_dir, "tarnhost")
    work = tempfile.mkdtemp(prefix="concurrency.")
    env = dict(os.environ, TARN_HOST_DB=os.path.join(work, "host.db"))
    env.pop("TARN_TRACE", None)
    env.pop("TARN_LOCK_TIMEOUT", None)  # the default wait is part of the test

    def run(*args):
        return subprocess.run(args, env=env, capture_output=True, text=True, errors="replace")

    def must(*args):
        r = run(*args)
        if r.returncode != 0:
            sys.exit(f"setup failed: {' '.join(args)}: {r.stderr.strip()}")

    must(tarnhost, "init")
    must(tool, "-a", "vs1")
    pnics = [f"pnic{4 + w}" for w in range(LINK_WORKERS)]
    for pnic in pnics:
        must(tarnhost, "pnic", "add", pnic)

    runs = []  # (argv, returncode, stderr), appended by every worker
    lock = threading.Lock()
    adding = threading.Event()
    adding.set()

    def record(args):
        r = run(*args)
        with lock:
            runs.append((args, r.returncode, r.stderr.strip()))
        return r.returncode

    def add_port_groups(w):
        for i in range(PGS_PER_WORKER):
            record((tool, "-A", f"pg{w}_{i}", "vswitch0"))

    last_linked = {}  # pnic -> state after its last command that exited 0

    def link_and_unlink(w):
        pnic = pnics[w]
        linked = False
        # Keep going while port groups are added; odd workers end linked.
        while adding.is_set() or linked != (w % 2 == 1):
            op = "-U" if linked else "-L"
            if record((tool, op, pnic, "vs1")) != 0:
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

    dump = run(tarnhost, "dump")
    if dump.returncode != 0:
        sys.exit(f"tarnhost dump failed: {dump.stderr}")
    tables = json.loads(dump.stdout)["tables"]
    for layer in (0, 1):
        present = {r["name"] for r in tables["portgroup"] if r["layer"] == layer}
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
    print(f"{len(runs)} runs ({adds} port group adds, {len(runs) - adds} links and unlinks) "
          f"in {elapsed:.1f} s; {len(failed)} failed")
    for f in failures:
        print("FAIL:", f)
    if not failures:
        shutil.rmtree(work)
    else:
        print("host kept in", work)
    sys.exit(1 if failures else 0)


if __name__ == "__main__":
    main()
