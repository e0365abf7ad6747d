#!/usr/bin/env python3
"""Changes killed with SIGKILL at random moments.

Each round runs a shell loop of changes (orvocfg-vswitch -A, -D and -a,
tarnhost pnic add), logging "S k" before change k and "A k" once it exited
0, and kills the whole loop after a random delay. After every kill:
  - the host opens (tarnhost dump exits 0);
  - sqlite3's PRAGMA integrity_check says ok;
  - every acknowledged change is there, nothing that was never started is,
    and a change that was started but not acknowledged is either there
    whole or not at all (in both layers alike).

usage: crash.py BIN_DIR [ROUNDS [SEED]]
"""
import json
import os
import random
import shlex
import shutil
import signal
import subprocess
import sys
import tempfile
import time

COMMANDS_PER_ROUND = 400


def main():
    bin_dir = sys.argv[1]
    rounds = int(sys.argv[2]) if len(sys.argv) > 2 else 120
    seed = int(sys.argv[3]) if len(sys.argv) > 3 else random.randrange(1 << 30)
    rng = random.Random(seed)
    tool = os.path.join(bin_dir, "orvocfg-vswitch")
    tarnhost = os.path.join(bin_dir, "tarnhost")
    work = tempfile.mkdtemp(prefix="crash.")
    db = os.path.join(work, "host.db")
    env = dict(os.environ, TARN_HOST_DB=db)
    env.pop("TARN_TRACE", None)
    subprocess.run([tarnhost, "init"], env=env, check=True)

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
            elif k % 4 == 3:
                changes.append(("pg", f"p{r}_{k - 1}", False,
                                [tool, "-D", f"p{r}_{k - 1}", "vswitch0"]))
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
            expected[kind][name] = {present} if k in acked else {present, not present}

        dump = subprocess.run([tarnhost, "dump"], env=env, capture_output=True, text=True)
        if dump.returncode != 0:
            failures.append(f"round {r}: host does not open: {dump.stderr.strip()}")
            break
        check = subprocess.run(["sqlite3", db, "PRAGMA integrity_check"], capture_output=True,
                               text=True)
        if check.stdout.strip() != "ok":
            failures.append(f"round {r}: integrity check: {check.stdout.strip()} {check.stderr}")
            break
        tables = json.loads(dump.stdout)["tables"]
        seen = {"pnic": {p["name"] for p in tables["pnic"]}}
        for layer in (0, 1):
            pgs = {p["name"] for p in tables["portgroup"] if p["layer"] == layer}
            switches = {s["name"] for s in tables["vswitch"] if s["layer"] == layer}
            if layer and (pgs != seen["pg"] or switches != seen["switch"]):
                failures.append(f"round {r}: the layers differ")
            seen["pg"], seen["switch"] = pgs, switches
        for kind, names in expected.items():
            for name, allowed in names.items():
                if (name in seen[kind]) not in allowed:
                    failures.append(f"round {r}: {kind} {name} is "
                                    f"{'there' if name in seen[kind] else 'missing'}")
                names[name] = {name in seen[kind]}  # settled now
            unknown = {n for n in seen[kind] if n[0] in "psn" and "_" in n} - set(names)
            if unknown:
                failures.append(f"round {r}: {kind} never started but there: {sorted(unknown)}")
        if failures:
            break

    elapsed = time.monotonic() - start
    print(f"seed {seed}: {r + 1} kills ({in_flight_kills} during a change), "
          f"{acknowledged} acknowledged changes checked, in {elapsed:.1f} s")
    for f in failures[:20]:
        print("FAIL:", f)
    if failures:
        print("host kept in", work)
        sys.exit(1)
    shutil.rmtree(work)


if __name__ == "__main__":
    main()
