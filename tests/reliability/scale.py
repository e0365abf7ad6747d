#!/usr/bin/env python3
"""A host with 100,000 port groups goes through tarnhost load and dump.

Loads a dump built from the default host's, dumps it again and compares the
text; the tool must still find a port group among them. How long it takes
is the benchmark's business (bench/run.py), not this test's.

usage: scale.py BIN_DIR [PORT_GROUPS]
"""
import json
import os
import subprocess
import sys

from common import Host


def main():
    bin_dir = sys.argv[1]
    count = int(sys.argv[2]) if len(sys.argv) > 2 else 100_000
    host = Host(bin_dir, "scale.")
    tarnhost, work, env = host.tarnhost, host.work, host.env
    base = host.dump()
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
    for step, argv, out in (("load", [tarnhost, "load", big], None),
                            ("dump", [tarnhost, "dump"], os.path.join(work, "again.json"))):
        with open(out or os.devnull, "w") as sink:
            r = subprocess.run(argv, env=env, stdout=sink, stderr=subprocess.PIPE, text=True)
        if r.returncode != 0:
            failures.append(f"{step} exited {r.returncode}: {r.stderr.strip()}")
    if not failures and subprocess.run(["cmp", "-s", big, os.path.join(work, "again.json")]).returncode:
        failures.append("the dump of the loaded host differs from the loaded dump")
    if not failures:
        check = host.run(host.tool, "-C", f"pg{count - 1}")
        if check.stdout != "1\n":
            failures.append(f"orvocfg-vswitch -C pg{count - 1} said {check.stdout!r}")

    host.finish(f"{count} port groups ({os.path.getsize(big) / 1e6:.0f} MB of JSON) loaded "
                "and dumped", failures)


if __name__ == "__main__":
    main()
