#!/usr/bin/env python3
"""Benchmark: cost of the tool's commands against the size of the host.

Builds hosts with tarnhost load of generated dumps, times whole runs of the
real binary (median of RUNS runs each, the hosts interleaved run by run so
that the machine's drift falls on both sides alike) and prints ratios
against their targets:

  - a command about one switch on a host of 10,000 port groups (100
    switches of 100) costs at most 1.25x what it costs on a host of 10;
  - -c costs at most 2.5x the start of a process that does nothing;
  - -l on 100,000 port groups takes at most 11x its time on 10,000, with a
    peak resident size under 64 MiB.

usage: bench/run.py [BIN_DIR] [RUNS]     (defaults: build/bin, 30)
Exit status 1 when a target is missed.
"""
import json
import os
import shutil
import statistics
import subprocess
import sys
import tempfile
import time

HERE = os.path.dirname(os.path.abspath(__file__))
BIN = os.path.abspath(sys.argv[1] if len(sys.argv) > 1 else os.path.join(HERE, "..", "build", "bin"))
RUNS = int(sys.argv[2]) if len(sys.argv) > 2 else 30
TOOL = os.path.join(BIN, "orvocfg-vswitch")
TARNHOST = os.path.join(BIN, "tarnhost")
TARGET = "bench50"  # the switch every single-object command acts on


def tarnhost(env, *args, stdout=None):
    return subprocess.run([TARNHOST, *args], env=env, check=True, stdout=stdout or subprocess.PIPE).stdout


def make_host(work, name, switches, groups_per_switch):
    """A host holding `switches` switches named bench0.. with
    `groups_per_switch` port groups each, plus free pnics for -L/-U."""
    env = dict(os.environ, TARN_HOST_DB=os.path.join(work, name + ".db"))
    env.pop("TARN_TRACE", None)
    tarnhost(env, "init", "--empty")
    dump = json.loads(tarnhost(env, "dump"))
    tables = dump["tables"]
    policy = {"flags": 16, "balancing": 0, "failback": 0,
              "linkCriteria": {"checkMask": 0, "minSpeed": 0, "errorPercent": 0, "fullDuplex": 0},
              "uplinkOrder": [], "maxActive": 0}
    group_policy = dict(policy, flags=0)
    seq = 1
    tables["pnic"] = []
    for i in range(4):
        tables["pnic"].append({"seq": seq, "name": f"pnic{i}"})
        seq += 1
    tables["vswitch"], tables["portgroup"] = [], []
    for s in range(switches):
        sw = f"bench{s}"
        for layer in (0, 1):
            tables["vswitch"].append({"layer": layer, "name": sw, "seq": seq, "num_ports": 4096,
                                      "mtu": 1500, "cdp": 1, "system": 0, "policy": policy})
        seq += 1
        for g in range(groups_per_switch):
            for layer in (0, 1):
                tables["portgroup"].append({"layer": layer, "name": f"{sw}-pg{g}", "switch": sw,
                                            "seq": seq, "vlan": g % 4096, "policy": group_policy})
            seq += 1
    tables["vswitch"].sort(key=lambda r: (r["layer"], r["name"]))
    tables["portgroup"].sort(key=lambda r: (r["layer"], r["name"]))
    for row in tables["meta"]:
        if row["key"] == "next_seq":
            row["value"] = str(seq)
    path = os.path.join(work, name + ".json")
    with open(path, "w") as f:
        json.dump(dump, f)
    tarnhost(env, "load", path)
    return env


# A process's peak resident size counts the memory of whoever forked it, so
# the peak is measured through a small fresh interpreter, not this one
# (which holds the generated hosts); its own size is the floor of the figure.
PEAK_HELPER = """
import os, subprocess, sys
p = subprocess.Popen(sys.argv[1:], stdout=subprocess.DEVNULL)
print(os.wait4(p.pid, 0)[2].ru_maxrss)
"""


def peak_rss_kib(argv, env):
    out = subprocess.run([sys.executable, "-S", "-c", PEAK_HELPER, *argv], env=env,
                         check=True, capture_output=True, text=True).stdout
    return int(out)


def run(argv, env):
    """Wall time of one run (and its peak resident size, KiB, floored by ours)."""
    start = time.perf_counter()
    proc = subprocess.Popen(argv, env=env, stdout=subprocess.DEVNULL, stderr=subprocess.PIPE)
    _, status, usage = os.wait4(proc.pid, 0)
    elapsed = time.perf_counter() - start
    err = proc.stderr.read()
    proc.stderr.close()
    proc.returncode = os.waitstatus_to_exitcode(status)
    if proc.returncode not in (0,) and argv[0] == TOOL and argv[1] != "-l":
        sys.exit(f"{' '.join(argv)} failed ({proc.returncode}): {err.decode(errors='replace')}")
    return elapsed, usage.ru_maxrss


# Commands about one object; a pair undoes its first half so that every
# run starts from the same host.
SINGLE = [
    ("-c", [["-c", TARGET]]),
    ("-A/-D", [["-A", "benchpg", TARGET], ["-D", "benchpg", TARGET]]),
    ("-L/-U", [["-L", "pnic1", TARGET], ["-U", "pnic1", TARGET]]),
    ("-x", [["-x", TARGET]]),
    ("-X", [["-X", "1", TARGET]]),
    ("-b", [["-b", TARGET]]),
    ("-B", [["-B", "listen", TARGET]]),
    ("-m", [["-m", "1500", TARGET]]),
]


def time_interleaved(cases, runs):
    """cases: {label: (env, [argv, ...])}; returns {label: [seconds...]}."""
    times = {label: [] for label in cases}
    for i in range(runs):
        order = list(cases.items())
        if i % 2:
            order.reverse()
        for label, (env, argvs) in order:
            total = 0.0
            for argv in argvs:
                total += run(argv, env)[0]
            times[label].append(total)
    return times


def main():
    work = tempfile.mkdtemp(prefix="bench.")
    try:
        print(f"building hosts in {work} ...", flush=True)
        small = make_host(work, "small", 1, 10)          # 10 port groups
        small_target = "bench0"
        large = make_host(work, "large", 100, 100)       # 10,000 port groups
        huge = make_host(work, "huge", 1000, 100)        # 100,000 port groups
        missed = []
        print(f"median of {RUNS} runs; host of 10 port groups vs host of 10,000")
        print(f"{'command':10} {'10 pgs ms':>10} {'10k pgs ms':>11} {'ratio':>6}  target")
        for label, argvs in SINGLE:
            small_argvs = [[a if a != TARGET else small_target for a in argv] for argv in argvs]
            t = time_interleaved({"small": (small, [[TOOL] + a for a in small_argvs]),
                                  "large": (large, [[TOOL] + a for a in argvs])}, RUNS)
            s, l = statistics.median(t["small"]), statistics.median(t["large"])
            ratio = l / s
            ok = ratio <= 1.25
            missed += [] if ok else [label]
            print(f"{label:10} {s*1e3:10.2f} {l*1e3:11.2f} {ratio:6.2f}  <= 1.25 {'ok' if ok else 'MISSED'}")

        t = time_interleaved({"true": (large, [["/bin/true"]]),
                              "-c": (large, [[TOOL, "-c", TARGET]])}, RUNS)
        s, l = statistics.median(t["true"]), statistics.median(t["-c"])
        ok = l / s <= 2.5
        missed += [] if ok else ["-c vs /bin/true"]
        print(f"-c {l*1e3:.2f} ms vs /bin/true {s*1e3:.2f} ms: ratio {l/s:.2f}  <= 2.5 {'ok' if ok else 'MISSED'}")

        t = time_interleaved({"10k": (large, [[TOOL, "-l"]]),
                              "100k": (huge, [[TOOL, "-l"]])}, RUNS)
        s, l = statistics.median(t["10k"]), statistics.median(t["100k"])
        peak = max(peak_rss_kib([TOOL, "-l"], huge) for _ in range(3)) / 1024
        floor = peak_rss_kib(["/bin/true"], huge) / 1024
        ok = l / s <= 11
        missed += [] if ok else ["-l growth"]
        print(f"-l 10k pgs {s*1e3:.1f} ms, 100k pgs {l*1e3:.1f} ms: ratio {l/s:.2f}  <= 11 {'ok' if ok else 'MISSED'}")
        ok = peak < 64
        missed += [] if ok else ["-l memory"]
        print(f"-l 100k pgs peak resident size {peak:.1f} MiB (measuring floor {floor:.1f} MiB)"
              f"  < 64 {'ok' if ok else 'MISSED'}")
        print("all targets hold" if not missed else "missed: " + ", ".join(missed))
        return 1 if missed else 0
    finally:
        shutil.rmtree(work, ignore_errors=True)


if __name__ == "__main__":
    sys.exit(main())
