#!/usr/bin/env python3
"""Changes killed with SIGKILL at random moments.

Each round runs a logged shell loop of changes (-A, -D, -a, pnic add, and
-L/-U of pnics on one switch) and kills it after a random delay. Then the
host must open, pass sqlite3's integrity check, hold every acknowledged
change, nothing never started, and an unacknowledged one whole or not at
all (both layers alike). A run is one change however many library calls it
makes: a pnic is linked to the switch exactly when it is in its teaming
order (-L and -U each link and store the order).

usage: crash.py BIN_DIR [ROUNDS [SEED]]
"""
import os
import random
import shlex
import signal
import subprocess
import sys
import time

from common import Host, names

COMMANDS_PER_ROUND = 400


def main():
    bin_dir = sys.argv[1]
    rounds = int(sys.argv[2]) if len(sys.argv) > 2 else 120
    seed = int(sys.argv[3]) if len(sys.argv) > 3 else random.randrange(1 << 30)
    rng = random.Random(seed)
    host = Host(bin_dir, "crash.")
    tool, tarnhost, work, env = host.tool, host.tarnhost, host.work, host.env
    host.must(tarnhost, "init")
    host.must(tool, "-a", "cs")
    uplinks = [f"c{i}" for i in range(4)]
    for pnic in uplinks:
        host.must(tarnhost, "pnic", "add", pnic)

    # name -> the states it may be in: {True} present, {False} absent.
    expected = {"pg": {}, "switch": {}, "pnic": {}}
    failures = []
    in_flight_kills = 0
    acknowledged = 0
    start = time.monotonic()

    for r in range(rounds):
        # Change k of this round: (kind, name, present afterwards, argv).
        changes = []
        for k in range(COMMANDS_PER_ROUND):
            if k % 8 == 7:
                changes.append(("switch", f"s{r}_{k}", True, [tool, "-a", f"s{r}_{k}"]))
            elif k % 8 == 5:
                changes.append(("pnic", f"n{r}_{k}", True, [tarnhost, "pnic", "add", f"n{r}_{k}"]))
            elif k % 8 in (1, 2):
                pnic = uplinks[k // 8 % len(uplinks)]
                changes.append(("link", pnic, None, [tool, "-L" if k % 8 == 1 else "-U", pnic, "cs"]))
            elif k % 8 == 3:
                changes.append(("pg", f"p{r}_{k - 3}", False,
                                [tool, "-D", f"p{r}_{k - 3}", "vswitch0"]))
            else:
                changes.append(("pg", f"p{r}_{k}", True, [tool, "-A", f"p{r}_{k}", "vswitch0"]))
        log = os.path.join(work, f"log{r}")
        script = os.path.join(work, "round.sh")
        with open(script, "w") as f:
            for k, (_, _, _, argv) in enumerate(changes):
                args = " ".join(shlex.quote(a) for a in argv)
                f.write(f"echo 'S {k}' >> {log}; {args} >/dev/null 2>&1 && echo 'A {k}' >> {log}\n")
        loop = subprocess.Popen(["bash", script], env=env, start_new_session=True)
        time.sleep(rng.uniform(0.005, 0.25))
        os.killpg(loop.pid, signal.SIGKILL)
        loop.wait()

        started, acked = set(), set()
        with open(log) if os.path.exists(log) else open(os.devnull) as f:
            for line in f:
                parts = line.split()
                if len(parts) == 2 and parts[1].isdigit():
                    (started if parts[0] == "S" else acked).add(int(parts[1]))
        acknowledged += len(acked)
        if started and max(started) not in acked:
            in_flight_kills += 1
        for k in sorted(started):
            kind, name, present, _ = changes[k]
            if kind != "link":
                expected[kind][name] = {present} if k in acked else {present, not present}

        tables = host.dump()["tables"]
        check = host.run("sqlite3", host.db, "PRAGMA integrity_check")
        if check.stdout.strip() != "ok":
            failures.append(f"round {r}: integrity check: {check.stdout.strip()} {check.stderr}")
            break
        seen = {"pnic": {p["name"] for p in tables["pnic"]}}
        for layer in (0, 1):
            pgs, switches = names(tables["portgroup"], layer), names(tables["vswitch"], layer)
            if layer and (pgs != seen["pg"] or switches != seen["switch"]):
                failures.append(f"round {r}: the layers differ")
            seen["pg"], seen["switch"] = pgs, switches
            links = sorted(l["pnic"] for l in tables["link"]
                           if l["layer"] == layer and l["switch"] == "cs")
            (cs,) = [v for v in tables["vswitch"] if v["layer"] == layer and v["name"] == "cs"]
            if sorted(cs["policy"]["uplinkOrder"]) != links:
                failures.append(f"round {r}: layer {layer}: cs linked to {links} but its order is "
                                f"{cs['policy']['uplinkOrder']}")
        for kind, states in expected.items():
            for name, allowed in states.items():
                if (name in seen[kind]) not in allowed:
                    failures.append(f"round {r}: {kind} {name} is "
                                    f"{'there' if name in seen[kind] else 'missing'}")
                states[name] = {name in seen[kind]}  # settled now
            unknown = {n for n in seen[kind] if n[0] in "psn" and "_" in n} - set(states)
            if unknown:
                failures.append(f"round {r}: {kind} never started but there: {sorted(unknown)}")
        if failures:
            break

    host.finish(f"seed {seed}: {r + 1} kills ({in_flight_kills} during a change), "
                f"{acknowledged} acknowledged changes checked, "
                f"in {time.monotonic() - start:.1f} s", failures)


if __name__ == "__main__":
    main()
