#!/usr/bin/env python3
"""Benchmark: what the tool's commands cost, against targets.

Builds hosts with `tarnhost load` of generated dumps and measures whole runs
of the real binaries: per command, instructions (callgrind), fsync-family
calls and reads and writes of the host file and its log (strace), the median wall time
with the fastest and slowest run and the least processor time; the peak
resident size of -l. Then it prints each target (the constants below) with
its figure and verdict. docs/performance.md describes the method, the
verdicts and how to reproduce each figure by hand.

usage: bench/run.py [--quick] [--keep DIR] [BIN_DIR] [RUNS]
  BIN_DIR  the built programs (default: build/bin)
  RUNS     wall-time runs of each small command (default 30, --quick 5);
           -l, load and dump run a third as often (at least 3 times)
  --quick  a smoke run: RUNS 5 and the big host of 10,000 port groups
  --keep   work in DIR and keep it: the hosts, their dumps and each
           command's callgrind output (for callgrind_annotate)

Exit status 1 when a target is missed on counts (instructions, fsyncs,
reads, writes, peak resident size: these do not move with the machine's
load) or missed for certain on wall time; a median missed within the runs'
spread is reported as "missed within noise" and leaves the status 0.
Status 2: nothing to judge (a measuring tool is missing, and
scripts/deps.sh --bench installs them; or a measured command failed).
"""
import argparse
import concurrent.futures
import os
import re
import shutil
import subprocess
import sys
import tempfile
import time
from dataclasses import dataclass

from hosts import SWITCH, make_host, new_host, tarnhost
from measure import (Counts, Failed, Spread, counts, instructions, missing_tools, peak_rss_kib,
                     time_interleaved)

HERE = os.path.dirname(os.path.abspath(__file__))

GROWTH = 1.10               # 10,000 port groups against 10, each figure
START = 1.5                 # -c against /bin/true, median wall time
DURABLE_FSYNCS = 2          # fsync-family calls of one change
LIST_US_PER_GROUP = 2.0     # -l at 100,000 port groups
LIST_PEAK_MIB = 16          # -l at 100,000 port groups
DUMP_LOAD_S = 1.0           # tarnhost dump and load of 100,000 port groups
SNAPSHOT_S = 0.2            # tarnhost snapshot save and restore of 100,000 port groups
DIFF_S = 1.0                # tarnhost diff of two hosts of 100,000 port groups
TRACE_JSON = 1.05           # -A with the JSON trace against the text trace, instructions

SMALL, LARGE, HUGE = 10, 10_000, 100_000  # port groups of the hosts
# On the big host, which keeps the snapshot "bench" of itself: the diff
# compares two hosts of its size (the host and the snapshot).
SNAPSHOT_COMMANDS = [["snapshot", "save", "copy"], ["snapshot", "restore", "bench"], ["diff", "bench"]]
COMPARED = f"{LARGE:,} vs {SMALL:,} port groups"

# Commands about one object. A pair undoes its first half, so that every
# run starts from the same host; the halves of -A/-D and -L/-U are also
# the durable changes whose fsyncs are counted alone.
ONE_OBJECT = [
    ("-c", [["-c", SWITCH]]),
    ("-A/-D", [["-A", "benchpg", SWITCH], ["-D", "benchpg", SWITCH]]),
    ("-L/-U", [["-L", "pnic1", SWITCH], ["-U", "pnic1", SWITCH]]),
    ("-x", [["-x", SWITCH]]),
    ("-X", [["-X", "1", SWITCH]]),
    ("-b", [["-b", SWITCH]]),
    ("-B", [["-B", "listen", SWITCH]]),
    ("-m", [["-m", "1500", SWITCH]]),
]
DURABLE = ("-A", "-D", "-L", "-U")
COUNT_NAMES = ("instructions", "fsyncs", "reads", "writes")


@dataclass
class Host:
    groups: int
    env: dict
    db: str
    home: str


@dataclass
class Row:
    """One target: what was measured against what is wanted."""
    figure: str
    measured: str
    target: str
    verdict: str  # "met", "MISSED", "missed within noise" or "" (shown only)


def tag(args):
    return re.sub(r"[^\w.-]+", "_", " ".join(args)).strip("_")


def number(n):
    return f"{n:,}"


def ms(seconds):
    v = seconds * 1e3
    return f"{v:.0f}" if v >= 100 else f"{v:.1f}" if v >= 10 else f"{v:.2f}"


def spread_text(s, fmt):
    bounds = f"{fmt(s.low)}-{fmt(s.high)}" if s.low is not None else "too few runs to bound"
    return f"{fmt(s.median)} [{bounds}]"


def ratio(small, large):
    if small == 0:
        return 1.0 if large == 0 else float("inf")
    return large / small


def count_row(figure, measured, value, limit, target):
    return Row(figure, measured, target, "met" if value <= limit else "MISSED")


def wall_row(figure, spread, limit, target, fmt):
    """A wall-time target: missed for certain only when the low bound of its
    spread misses it too."""
    verdict = ("met" if spread.median <= limit
               else "MISSED" if spread.low is not None and spread.low > limit
               else "missed within noise")
    return Row(figure, spread_text(spread, fmt), target, verdict)


def table(headers, rows):
    widths = [max(len(str(r[i])) for r in [headers, *rows]) for i in range(len(headers))]
    lines = ["  ".join(str(c).ljust(w) for c, w in zip(r, widths)).rstrip() for r in [headers, *rows]]
    lines.insert(1, "  ".join("-" * w for w in widths))
    return "\n".join(lines)


class Bench:
    def __init__(self, bin_dir, runs, big, work, keep):
        self.tool = os.path.join(bin_dir, "orvocfg-vswitch")
        self.tarnhost = os.path.join(bin_dir, "tarnhost")
        self.runs, self.big_runs, self.big = runs, max(3, runs // 3), big
        self.work, self.keep = work, keep

    # -- hosts -------------------------------------------------------------
    def host(self, name, groups=None, *init):
        """The host `name`: of `groups` port groups, or made by tarnhost init INIT."""
        home = os.path.join(self.work, name)
        env = (make_host(self.tarnhost, home, groups) if groups is not None
               else new_host(self.tarnhost, home, *init))
        return Host(groups or 0, env, env["TARN_HOST_DB"], home)

    def build_hosts(self):
        # "small" and "large": names of one length, so that no run of the
        # comparison differs by the length of its file names
        self.small, self.large = self.host("small", SMALL), self.host("large", LARGE)
        self.huge = self.host("big", self.big)
        self.default = self.host("default")
        self.traced = self.host("traced", SMALL)
        self.scratch = self.host("scratch", None, "--empty")
        self.dump_file = os.path.join(self.huge.home, "dump.json")
        with open(self.dump_file, "wb") as f:
            f.write(tarnhost(self.tarnhost, self.huge.env, "dump"))
        # restore and diff meet the host as saved: every run leaves it so
        tarnhost(self.tarnhost, self.huge.env, "snapshot", "save", "bench")

    def reset_scratch(self):
        tarnhost(self.tarnhost, self.scratch.env, "init", "--empty")

    # -- counts (one run each; two at a time, as the machine's load does not
    # move them) ------------------------------------------------------------
    def count(self, host, argvs, prepare=None):
        """Counts of argvs run one after the other on `host`."""
        scratches = [os.path.join(host.home, tag(os.path.basename(a) for a in argv)) for argv in argvs]
        return counts(argvs, host.env, scratches, host.db, prepare, self.keep)

    def count_one_object(self, host):
        return {label: self.count(host, [[self.tool, *a] for a in argvs]) for label, argvs in ONE_OBJECT}

    def count_big(self):
        lst, = self.count(self.huge, [[self.tool, "-l"]])
        peak = max(peak_rss_kib([self.tool, "-l"], self.huge.env, os.path.join(self.huge.home, "l"))
                   for _ in range(3))
        floor = peak_rss_kib(["/bin/true"], self.huge.env, os.path.join(self.huge.home, "true"))
        dump, = self.count(self.huge, [[self.tarnhost, "dump"]])
        snapshots = self.count(self.huge, [[self.tarnhost, *a] for a in SNAPSHOT_COMMANDS])
        return lst, peak, floor, dump, snapshots

    def count_trace(self):
        """Instructions of -A with the text trace and with the JSON trace."""
        host, result = self.traced, {}
        for form in ("text", "json"):
            env = dict(host.env, TARN_TRACE=os.path.join(host.home, "trace." + form))
            env.pop("TARN_TRACE_FORMAT", None)
            if form == "json":
                env["TARN_TRACE_FORMAT"] = "json"
            scratch = os.path.join(host.home, "A-trace-" + form)
            result[form] = instructions([self.tool, "-A", "benchpg", SWITCH], env, scratch)
            if not self.keep:
                os.unlink(scratch + ".callgrind")
            subprocess.run([self.tool, "-D", "benchpg", SWITCH], env=env, check=True)
        return result

    def count_all(self):
        load = [self.tarnhost, "load", self.dump_file]
        jobs = {  # longest first: two workers
            "load": lambda: self.count(self.scratch, [load], self.reset_scratch)[0],
            "big": self.count_big,
            "small": lambda: self.count_one_object(self.small),
            "large": lambda: self.count_one_object(self.large),
            "start": lambda: self.count(self.default, [[self.tool, "-c", "vswitch0"], ["/bin/true"]]),
            "trace": self.count_trace,
        }
        with concurrent.futures.ThreadPoolExecutor(max_workers=2) as pool:
            futures = {name: pool.submit(job) for name, job in jobs.items()}
            c = {name: f.result() for name, f in futures.items()}
        self.counts_small, self.counts_large = c["small"], c["large"]
        self.counts_c, self.counts_true = c["start"]
        self.counts_list, self.peak_kib, self.floor_kib, self.counts_dump, self.counts_snapshots = c["big"]
        self.counts_load = c["load"]
        self.counts_trace = c["trace"]

    # -- wall time (one run at a time) ---------------------------------------
    def time_all(self):
        self.wall_one_object = {}
        for label, argvs in ONE_OBJECT:
            self.wall_one_object[label] = time_interleaved({
                "small": (self.small.env, [[self.tool, *a] for a in argvs], None),
                "large": (self.large.env, [[self.tool, *a] for a in argvs], None)}, self.runs)
        self.wall_start = time_interleaved({
            "true": (self.default.env, [["/bin/true"]], None),
            "-c": (self.default.env, [[self.tool, "-c", "vswitch0"]], None)}, self.runs)
        t = time_interleaved({
            "-l": (self.huge.env, [[self.tool, "-l"]], None),
            "dump": (self.huge.env, [[self.tarnhost, "dump"]], None),
            **{" ".join(a): (self.huge.env, [[self.tarnhost, *a]], None) for a in SNAPSHOT_COMMANDS},
            "load": (self.scratch.env, [[self.tarnhost, "load", self.dump_file]],
                     self.reset_scratch)}, self.big_runs)
        self.wall_list, self.wall_dump, self.wall_load = (t[k] for k in ("-l", "dump", "load"))
        self.wall_snapshots = [t[" ".join(a)] for a in SNAPSHOT_COMMANDS]

    # -- report ---------------------------------------------------------------
    def measurements(self):
        rows = []

        def add(command, host, runs, c):
            timing = ([spread_text(Spread.of(runs), ms), ms(min(r.cpu for r in runs))] if runs
                      else ["(in the pair)", ""])
            rows.append([command, host, *timing, *(number(v) for v in c.values())])

        for label, argvs in ONE_OBJECT:
            for host, name, cs in (("small", number(SMALL), self.counts_small),
                                   ("large", number(LARGE), self.counts_large)):
                add(label, name, self.wall_one_object[label][host], sum(cs[label], Counts()))
                if len(argvs) > 1:
                    for a, c in zip(argvs, cs[label]):
                        add("  " + " ".join(a), name, None, c)
        big = number(self.huge.groups)
        add("-c vswitch0", "1 (default host)", self.wall_start["-c"], self.counts_c)
        add("/bin/true", "-", self.wall_start["true"], self.counts_true)
        add("-l", big, self.wall_list, self.counts_list)
        add("tarnhost dump", big, self.wall_dump, self.counts_dump)
        add("tarnhost load", big, self.wall_load, self.counts_load)
        for a, runs, c in zip(SNAPSHOT_COMMANDS, self.wall_snapshots, self.counts_snapshots):
            add("tarnhost " + " ".join(a), big, runs, c)
        return table(["command", "port groups", "wall ms median [min-max]", "cpu ms min",
                      *COUNT_NAMES], rows)

    def targets(self):
        rows = []
        growth = f"<= {GROWTH:.2f}x"
        for label, _ in ONE_OBJECT:
            small = sum(self.counts_small[label], Counts()).values()
            large = sum(self.counts_large[label], Counts()).values()
            for name, s, l in zip(COUNT_NAMES, small, large):
                r = ratio(s, l)
                rows.append(count_row(f"{label} {name}, {COMPARED}",
                                      f"{r:.2f}x ({number(s)} -> {number(l)})", r, GROWTH, growth))
            t = self.wall_one_object[label]
            rows.append(wall_row(f"{label} wall time, {COMPARED}",
                                 Spread.ratio(t["large"], t["small"]), GROWTH, growth,
                                 lambda v: f"{v:.2f}x"))
        rows.append(wall_row("-c vswitch0 wall time vs /bin/true",
                             Spread.ratio(self.wall_start["-c"], self.wall_start["true"]),
                             START, f"<= {START:.1f}x", lambda v: f"{v:.2f}x"))
        c, t = self.counts_c.instructions, self.counts_true.instructions
        rows.append(Row("-c vswitch0 instructions vs /bin/true",
                        f"{ratio(t, c):.1f}x ({number(c)} vs {number(t)})", "(shown only)", ""))
        for label, argvs in ONE_OBJECT:
            for argv, c in zip(argvs, self.counts_large[label]):
                if argv[0] in DURABLE:
                    rows.append(count_row(f"{argv[0]} alone, fsync-family calls ({number(LARGE)})",
                                          str(c.fsyncs), c.fsyncs, DURABLE_FSYNCS,
                                          f"<= {DURABLE_FSYNCS}"))
        g = self.huge.groups
        rows.append(wall_row(f"-l wall time per port group ({number(g)})",
                             Spread.limit(self.wall_list).scaled(1e6 / g), LIST_US_PER_GROUP,
                             f"<= {LIST_US_PER_GROUP:g} us", lambda v: f"{v:.2f} us"))
        peak, floor = self.peak_kib / 1024, self.floor_kib / 1024
        rows.append(Row(f"-l peak resident size ({number(g)})", f"{peak:.1f} MiB (floor {floor:.1f})",
                        f"< {LIST_PEAK_MIB} MiB", "met" if peak < LIST_PEAK_MIB else "MISSED"))
        limit = DUMP_LOAD_S * g / HUGE
        for name, spread in (("dump", self.wall_dump), ("load", self.wall_load)):
            rows.append(wall_row(f"tarnhost {name} wall time ({number(g)})", Spread.limit(spread), limit,
                                 f"<= {limit * 1e3:g} ms", lambda v: f"{v * 1e3:.0f} ms"))
        for a, spread in zip(SNAPSHOT_COMMANDS, self.wall_snapshots):
            limit = (DIFF_S if a[0] == "diff" else SNAPSHOT_S) * g / HUGE
            rows.append(wall_row(f"tarnhost {' '.join(a)} wall time ({number(g)})", Spread.limit(spread),
                                 limit, f"<= {limit * 1e3:g} ms", lambda v: f"{v * 1e3:.0f} ms"))
        text, json = self.counts_trace["text"], self.counts_trace["json"]
        rows.append(count_row(f"-A instructions, JSON trace vs text trace ({number(SMALL)})",
                              f"{ratio(text, json):.3f}x ({number(text)} -> {number(json)})",
                              ratio(text, json), TRACE_JSON, f"<= {TRACE_JSON:.2f}x"))
        return rows


def main():
    parser = argparse.ArgumentParser(usage=__doc__.split("usage: ")[1].split("\n")[0])
    parser.add_argument("bin_dir", nargs="?", default=os.path.join(HERE, "..", "build", "bin"))
    parser.add_argument("runs", nargs="?", type=int)
    parser.add_argument("--quick", action="store_true")
    parser.add_argument("--keep", metavar="DIR")
    args = parser.parse_args()
    missing = missing_tools()
    if missing:
        print(f"missing: {', '.join(missing)} (scripts/deps.sh --bench installs the measuring tools)",
              file=sys.stderr)
        return 2
    runs = args.runs or (5 if args.quick else 30)
    big = LARGE if args.quick else HUGE
    if args.keep:
        os.makedirs(args.keep)
    work = os.path.abspath(args.keep or tempfile.mkdtemp(prefix="bench."))
    bench = Bench(os.path.abspath(args.bin_dir), runs, big, work, bool(args.keep))
    try:
        for say, step in (
                (f"hosts in {work}: {SMALL:,}, {LARGE:,} and {big:,} port groups; the default host",
                 bench.build_hosts),
                ("counting: callgrind and strace, one run of each command, two at a time",
                 bench.count_all),
                (f"timing: {runs} runs of each small command, {bench.big_runs} of -l, dump and load",
                 bench.time_all)):
            print(say, "...", end=" ", flush=True)
            start = time.monotonic()
            step()
            print(f"{time.monotonic() - start:.0f} s", flush=True)
    except Failed as e:
        print(f"failed: {e}", file=sys.stderr)
        return 2
    finally:
        if not args.keep:
            shutil.rmtree(work, ignore_errors=True)
    print()
    print("Measurements (counts: one run each; reads and writes: calls on the host file and its log;"
          " fsyncs: on any file)")
    print(bench.measurements())
    rows = bench.targets()
    print()
    print("Targets (wall time: median [low bound-high bound]: for a ratio the rounds' ratios, for a"
          " limit the least processor time and the slowest run; a pair's commands count together)")
    print(table(["figure", "measured", "target", "verdict"],
                [[r.figure, r.measured, r.target, r.verdict] for r in rows]))
    missed = [r.figure for r in rows if r.verdict == "MISSED"]
    noise = [r.figure for r in rows if r.verdict == "missed within noise"]
    judged = [r for r in rows if r.verdict]
    print()
    print(f"{len(judged) - len(missed) - len(noise)} of {len(judged)} targets met, "
          f"{len(missed)} missed (on counts or beyond the runs' spread), "
          f"{len(noise)} missed within noise")
    return 1 if missed else 0


if __name__ == "__main__":
    sys.exit(main())
