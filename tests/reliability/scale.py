#!/usr/bin/env python3
"""A host with 100,000 port groups goes through tarnhost load and dump.

Builds the dump from the default host's own dump, loads it, dumps it again
and compares the text; each step must finish within its time limit (about
ten times what it takes on an idle 2-core machine: room for a busy machine,
far too little for work that grows faster than the host), and the tool must
still find a port group among them.

usage: scale.py BIN_DIR [PORT_GROUPS]
"""
import json
import os
import shutil
import subprocess
import sys
import tempfile
import time

LIMIT_SECONDS = {"load": 20, "dump": 10}


def main():
    bin_dir = sys.argv[1]
    count = int(sys.argv[2]) if len(sys.argv) > 2 else 100_000
    tarnhost = os.path.join(bin_dir, "tarnhost")
    work = tempfile.mkdtemp(prefix="scale.")
    env = dict(os.environ, TARN_HOST_DB=os.path.join(work, "host.db"))
    env.pop("TARN_TRACE", None)
    base = json.loads(subprocess.run([tarnhost, "dump"], env=env, capture_output=True,
                                     check=True).stdout)
    tables = base["tables"]
    meta = {m["key"]: m for m in tables["meta"]}
    seq = int(meta["next_seq"]["value"])
    template = tables["portgroup"][0]
    rows = []
    for layer in (0, 1):
        rows += [r for r in tables["portgroup"] if r["layer"] == layer]
        rows += [dict(template, layer=layer, name=f"pg{i}", seq=seq + i) for i in range(count)]
    tables["portgroup"] = rows
    meta["next_seq"]["value"] = str(seq + count)
    big = os.path.join(work, "big.json")
    with open(big, "w") as f:
        f.write(json.dumps(base, indent=2, ensure_ascii=False) + "\n")

    failures = []
    timings = {}
    for step, argv, out in (("load", [tarnhost, "load", big], None),
                            ("dump", [tarnhost, "dump"], os.path.join(work, "again.json"))):
        t = time.monotonic()
        with open(out or os.devnull, "w") as sink:
            r = subprocess.run(argv, env=env, stdout=sink, stderr=subprocess.PIPE, text=True)
        timings[step] = time.monotonic() - t
        if r.returncode != 0:
            failures.append(f"{step} exited {r.returncode}: {r.stderr.strip()}")
        elif timings[step] > LIMIT_SECONDS[step]:
            failures.append(f"{step} took {timings[step]:.1f} s (limit {LIMIT_SECONDS[step]} s)")
    if not failures and subprocess.run(["cmp", "-s", big, os.path.join(work, "again.json")]).returncode:
        failures.append("the dump of the loaded host differs from the loaded dump")
    if not failures:
        check = subprocess.run([os.path.join(bin_dir, "orvocfg-vswitch"), "-C", f"pg{count - 1}"],
                               env=env, capture_output=True, text=True)
        if check.stdout != "1\n":
            failures.append(f"orvocfg-vswitch -C pg{count - 1} said {check.stdout!r}")

    size = os.path.getsize(big) / 1e6
    print(f"{count} port groups ({size:.0f} MB of JSON): load {timings.get('load', 0):.1f} s, "
          f"dump {timings.get('dump', 0):.1f} s")
    for f in failures:
        print("FAIL:", f)
    if failures:
        print("kept in", work)
        sys.exit(1)
    shutil.rmtree(work)


if __name__ == "__main__":
    main()
