#!/usr/bin/env python3
"""I/O faults at every file call of a command, injected with strace.

One run under strace counts the command's calls of each kind; then, for
each occurrence N of a call, the command runs on a fresh copy of its
prepared host with that occurrence failing (EIO; ENOSPC too for writes) or
the process killed on it (writes and syncs). Opens, reads, stats and write()
are counted and hit only on the host's files (file, log, journal, directory
and input file: not the loader's files nor standard error); pwrite64, syncs,
truncates and locks wherever they go. After each run the host must open,
pass sqlite3's integrity check, and be exactly the host before or after the
command (after when the status is 0), a failure said in one line that never
tells the user to move a good host away. A run is clean (before, status not
0), a success (after, 0), committed (after, not 0), lost (before, 0),
corrupt (does not open, not intact, or neither host) or unclear (its
message); the last three fail.

usage: faults.py BIN_DIR [--full] [--every K]
  default: every write and sync of -A, client add and snapshot restore,
           every stat of -A, every write and read of tarnhost init on a
           missing file
  --full:  every command, every call, every fault
  --every K: only occurrences 1, 1+K, 1+2K, ... and the last
"""
import argparse
import json
import os
import re
import shlex
import shutil
import subprocess
import tempfile
from collections import Counter
from concurrent.futures import ThreadPoolExecutor

from common import Host

GROUPS = {"write": ["pwrite64", "write"], "sync": ["fsync", "fdatasync"],
          "truncate": ["ftruncate"], "open": ["openat"], "lock": ["fcntl", "flock"],
          "read": ["pread64", "read"], "stat": ["fstat", "newfstatat", "stat"]}
GROUP_OF = {call: g for g, calls in GROUPS.items() for call in calls}
ON_HOST_PATHS = {"write", "openat", "pread64", "read", "fstat", "newfstatat", "stat"}
CLASSES = ["clean", "success", "committed", "lost", "corrupt", "unclear"]
BAD = {"lost", "corrupt", "unclear"}
CREATED = re.compile(r"^(tarnhost: )?created a new default host at ")
MISSING = "missing"


def faults_of(call):
    kinds = ["error=EIO"]
    if GROUP_OF[call] == "write":
        kinds.append("error=ENOSPC")
    if GROUP_OF[call] in ("write", "sync"):
        kinds.append("signal=KILL")
    return kinds


def commands(host, work):
    """(name, argv, setup steps, input file) of each command under test."""
    tool, th = host.tool, host.tarnhost
    dump = os.path.join(work, "load.json")
    return [
        ("-A", [tool, "-A", "PG", "vswitch0"], [[th, "init"]], None),
        ("client add", [th, "client", "add", "Management", "vm1"], [[th, "init"]], None),
        ("init missing", [th, "init"], [], None),
        ("-L", [tool, "-L", "pnic7", "vswitch0"],
         [[th, "init"], [th, "pnic", "add", "pnic7"]], None),
        ("-d", [tool, "-d", "vSwitchX"], [[th, "init"], [tool, "-a", "vSwitchX"]], None),
        ("init existing", [th, "init"],
         [[th, "init"], [tool, "-A", "Extra", "vswitch0"], [th, "pnic", "add", "pnic7"]], None),
        ("load", [th, "load", dump],
         [[th, "init"], [tool, "-A", "Loaded", "vswitch0"], ("dump", dump),
          [tool, "-D", "Loaded", "vswitch0"], [tool, "-a", "vSwitchX"]], dump),
        ("-l", [tool, "-l"], [[th, "init"], [tool, "-a", "vSwitchX"]], None),
        ("snapshot restore", [th, "snapshot", "restore", "base"],
         [[th, "init"], [th, "snapshot", "save", "base"], [tool, "-A", "Extra", "vswitch0"],
          [th, "pnic", "add", "pnic7"]], None),
    ]


class Fixture:
    """A command with its prepared host and the host before and after it."""

    def __init__(self, host, root, index, name, argv, steps, input_file):
        self.host, self.name, self.argv = host, name, argv
        self.prep = os.path.join(root, f"prep{index}")
        os.mkdir(self.prep)
        db = os.path.join(self.prep, "host.db")
        for step in steps:
            if step[0] == "dump":
                with open(step[1], "w") as f:
                    f.write(self.must(db, host.tarnhost, "dump").stdout)
            else:
                self.must(db, *step)
        self.input_file = input_file
        self.before = self.state(self.fresh(root, "before"))[0]
        run = self.fresh(root, "after")
        self.must(run, *argv)
        self.after = self.state(run)[0]

    def must(self, db, *argv):
        r = self.host.run_as(db, *argv)
        if r.returncode != 0:
            raise SystemExit(f"setup of {self.name} failed: {' '.join(argv)}: {r.stderr.strip()}")
        return r

    def fresh(self, root, label):
        """A copy of the prepared host in a new directory: the path of its file."""
        run = tempfile.mkdtemp(prefix=label + ".", dir=root)
        shutil.copytree(self.prep, run, dirs_exist_ok=True)
        return os.path.join(run, "host.db")

    def state(self, db):
        """(dump, None) of the host at db, or (None, why it is corrupt)."""
        first = MISSING if not os.path.exists(db) or os.path.getsize(db) == 0 else None
        dump = self.host.run_as(db, self.host.tarnhost, "dump")
        if dump.returncode != 0:
            return None, f"does not open: {dump.stderr.strip()}"
        check = subprocess.run(["sqlite3", db, "PRAGMA integrity_check"], capture_output=True,
                               text=True)
        if check.stdout.strip() != "ok":
            return None, f"integrity check: {(check.stdout + check.stderr).strip()[:200]}"
        return first or json.loads(dump.stdout), None

    def strace(self, db, call, extra):
        argv = ["strace", "-f", "-o", "/dev/null"] if extra else ["strace", "-f"]
        if any(c in ON_HOST_PATHS for c in call.split(",")):
            for p in [db, db + "-wal", db + "-journal", os.path.dirname(db), self.input_file,
                      db + ".snapshots/base"]:
                if p:
                    argv += ["-P", p]
        return argv + ["-e", f"trace={call}"] + extra + ["--"] + self.argv

    def count(self, root, calls):
        """How often the command makes each call (those on the host's paths and the rest)."""
        counts = Counter()
        for subset in ([c for c in calls if c in ON_HOST_PATHS],
                       [c for c in calls if c not in ON_HOST_PATHS]):
            if not subset:
                continue
            db = self.fresh(root, "count")
            trace = os.path.join(os.path.dirname(db), "trace")
            argv = self.strace(db, ",".join(subset), [])
            argv[2:2] = ["-o", trace]
            r = self.host.run_as(db, *argv)
            if r.returncode != 0:
                raise SystemExit(f"counting {self.name} failed: {r.stderr.strip()}")
            with open(trace) as f:
                for line in f:
                    m = re.match(r"\d+ +(\w+)\(", line)
                    if m and m.group(1) in subset:
                        counts[m.group(1)] += 1
            shutil.rmtree(os.path.dirname(db))
        if not counts:
            raise SystemExit(f"strace counted none of {', '.join(calls)} in {self.name}")
        return counts

    def inject(self, root, call, fault, n):
        """Runs the command with the fault at occurrence n: (class, why, repro)."""
        db = self.fresh(root, "run")
        argv = self.strace(db, call, ["-e", f"inject={call}:{fault}:when={n}"])
        r = self.host.run_as(db, *argv)
        repro = (f"d=$(mktemp -d) && cp -a {self.prep}/. $d && TARN_HOST_DB=$d/host.db "
                 + " ".join(shlex.quote(a) for a in argv).replace(os.path.dirname(db), "$d"))
        state, why = self.state(db)
        killed = r.returncode < 0
        lines = [l for l in r.stderr.splitlines() if not CREATED.match(l)]
        created = len(lines) < len(r.stderr.splitlines())  # then the change is the creation
        if state is None:
            result = ("corrupt", why)
        elif state != self.after and state != self.before:
            result = ("corrupt", "the host is neither the one before nor the one after")
        elif r.returncode == 0 and state != self.after:
            result = ("lost", "status 0 but the host is the one before")
        elif not killed and (len(lines) != (r.returncode != 0) or any(
                "no transaction is active" in l or "move it away" in l or "malformed" in l
                # what a message says of the change must be what happened
                or ("change was made" in l and state != self.after)
                or ("change was not made" in l and state == self.after != self.before
                    and not created)
                for l in lines)):
            result = ("unclear", f"status {r.returncode}, stderr {r.stderr.strip()!r}")
        elif state == self.after and (state != self.before or r.returncode == 0):
            result = ("success" if r.returncode == 0 else "committed", "")
        else:
            result = ("clean", "")
        if result[0] in BAD:
            return result + (repro,)
        shutil.rmtree(os.path.dirname(db))
        return result + ("",)


def main():
    parser = argparse.ArgumentParser()
    parser.add_argument("bin_dir")
    parser.add_argument("--full", action="store_true")
    parser.add_argument("--every", type=int, default=1)
    args = parser.parse_args()
    host = Host(os.path.abspath(args.bin_dir), "faults.")
    # LeakSanitizer stops the program's threads with ptrace, which strace holds.
    host.env["ASAN_OPTIONS"] = os.environ.get("ASAN_OPTIONS", "") + ":detect_leaks=0"
    chosen = commands(host, host.work)
    if args.full:
        plan = [(c, list(GROUP_OF)) for c in chosen]
    else:
        ci = {"-A": ["write", "sync", "stat"], "client add": ["write", "sync"],
              "init missing": ["write", "read"], "snapshot restore": ["write", "sync"]}
        plan = [(c, [call for g in ci[c[0]] for call in GROUPS[g]]) for c in chosen if c[0] in ci]

    jobs, setup = [], []
    for i, ((name, argv, steps, input_file), calls) in enumerate(plan):
        fx = Fixture(host, host.work, i, name, argv, steps, input_file)
        if (fx.before == fx.after) != (name == "-l"):
            setup.append(f"{name}: run normally, it {'changed' if name == '-l' else 'kept'} the host")
        counts = fx.count(host.work, calls)
        for call in calls:
            n = counts[call]
            points = sorted(set(range(1, n + 1, args.every)) | ({n} if n else set()))
            jobs += [(fx, call, fault, k) for fault in faults_of(call) for k in points]

    with ThreadPoolExecutor(max_workers=min(2, os.cpu_count() or 1)) as pool:
        results = list(pool.map(lambda j: j + j[0].inject(host.work, *j[1:]), jobs))

    table = {}
    firsts, others = [], []  # the first failure of each row and class, then the rest
    for fx, call, fault, k, cls, why, repro in results:
        row = table.setdefault((fx.name, call, fault.split("=")[1]), Counter())
        row[cls] += 1
        if cls in BAD:
            (firsts if row[cls] == 1 else others).append(
                f"{fx.name}: {call} {fault} at {k}: {cls}: {why}\n  {repro}")
    width = 18
    lines = [f"{'command':<{width}}{'call':<12}{'fault':<8}{'runs':>6}"
             + "".join(f"{c:>11}" for c in CLASSES)]
    for (name, call, fault), row in table.items():
        lines.append(f"{name:<{width}}{call:<12}{fault:<8}{sum(row.values()):>6}"
                     + "".join(f"{row[c]:>11}" for c in CLASSES))
    kills = [r for r in results if r[0].name == "init missing" and r[2] == "signal=KILL"]
    unopened = sum(1 for r in kills if r[5].startswith("does not open"))
    lines.append(f"\n{len(results)} runs; tarnhost init on a missing file: {len(kills)} kill "
                 f"points, {unopened} of them left a host that does not open")
    host.finish("\n".join(lines), setup + firsts + others)


if __name__ == "__main__":
    main()
