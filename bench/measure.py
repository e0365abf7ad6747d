"""What the benchmark measures of one whole run of a program.

- counts, which do not move with the machine's load, one run each:
  instructions (valgrind --tool=callgrind; the same binary on the same
  input executes the same instructions) and system calls (strace -f):
  fsync-family calls on any file, reads and writes on the host file and its log;
- peak resident size, through /usr/bin/time, a small program, because a
  child's peak includes the memory of the process that forked it;
- wall time, which does: the runs of the cases of a comparison are
  interleaved in rounds, so that the machine's drift falls on all of them
  alike, and a ratio is judged by the rounds' ratios; a time limit is
  judged against the processor time too, which the load hardly moves.
"""
import math
import os
import re
import shutil
import statistics
import subprocess
import time
from dataclasses import dataclass

TOOLS = ("valgrind", "strace", "/usr/bin/time")

FSYNCS = ("fsync", "fdatasync", "sync_file_range", "msync")
READS = ("read", "pread64", "readv", "preadv", "preadv2")
WRITES = ("write", "pwrite64", "writev", "pwritev", "pwritev2")
# One traced call, as strace -f -y prints it: "PID NAME(FD<PATH>, ...".
CALL = re.compile(r"^\d+\s+(\w+)\((?:(\d+)<([^>]*)>)?")


def missing_tools():
    """The measuring tools that are not installed."""
    return [tool for tool in TOOLS if not shutil.which(tool)]


@dataclass
class Counts:
    instructions: int = 0
    fsyncs: int = 0
    reads: int = 0   # read-family calls on the host file and its log
    writes: int = 0  # write-family calls on the host file and its log

    def __add__(self, other):
        return Counts(*(a + b for a, b in zip(self.values(), other.values())))

    def values(self):
        return (self.instructions, self.fsyncs, self.reads, self.writes)


class Failed(Exception):
    pass


def check_exit(argv, proc):
    """Raises Failed, with what argv said on stderr, unless it exited with 0."""
    if proc.returncode != 0:
        err = proc.stderr.decode(errors="replace") if proc.stderr else ""
        raise Failed(f"{' '.join(argv)} exited with {proc.returncode}: {err.strip()}")


def instructions(argv, env, scratch):
    """Instructions that one run of argv executes (callgrind's total)."""
    out = scratch + ".callgrind"
    cmd = ["valgrind", "--tool=callgrind", "--callgrind-out-file=" + out, *argv]
    proc = subprocess.run(cmd, env=env, stdout=subprocess.DEVNULL, stderr=subprocess.PIPE)
    check_exit(argv, proc)
    with open(out) as f:
        for line in f:
            if line.startswith(("summary:", "totals:")):
                return int(line.split()[1])
    raise Failed(f"no total in {out}")


def syscalls(argv, env, scratch, db):
    """(fsync-family calls, reads of `db` and its log, writes of them) of one
    run of argv."""
    out = scratch + ".strace"
    names = ",".join(FSYNCS + READS + WRITES)
    cmd = ["strace", "-f", "-qq", "--seccomp-bpf", "-y", "-s", "0", "-e", "trace=" + names,
           "-o", out, *argv]
    proc = subprocess.run(cmd, env=env, stdout=subprocess.DEVNULL, stderr=subprocess.PIPE)
    check_exit(argv, proc)
    fsyncs = reads = writes = 0
    files = {os.path.realpath(db), os.path.realpath(db) + "-wal"} if db else set()
    with open(out, errors="replace") as f:
        for line in f:
            m = CALL.match(line)
            if not m:
                continue
            name, path = m.group(1), m.group(3)
            if name in FSYNCS:
                fsyncs += 1
            elif path in files:
                reads += name in READS
                writes += name in WRITES
    os.unlink(out)
    return fsyncs, reads, writes


def counts(argvs, env, scratches, db, prepare=None, keep=False):
    """Counts of each of argvs run one after the other on the host file `db`
    (None: no host file): the sequence once under callgrind (the output of
    each run kept in SCRATCH.callgrind when `keep`), then once under strace;
    `prepare` (or None) runs before each run."""
    n = []
    for argv, scratch in zip(argvs, scratches):
        if prepare:
            prepare()
        n.append(instructions(argv, env, scratch))
        if not keep:
            os.unlink(scratch + ".callgrind")
    result = []
    for argv, scratch, i in zip(argvs, scratches, n):
        if prepare:
            prepare()
        result.append(Counts(i, *syscalls(argv, env, scratch, db)))
    return result


def peak_rss_kib(argv, env, scratch):
    """Peak resident size of one run of argv, started by /usr/bin/time."""
    out = scratch + ".rss"
    proc = subprocess.run(["/usr/bin/time", "-f", "%M", "-o", out, *argv], env=env,
                          stdout=subprocess.DEVNULL, stderr=subprocess.PIPE)
    check_exit(argv, proc)
    with open(out) as f:
        return int(f.read().split()[-1])


@dataclass
class Run:
    """One timed run: its wall time and its processor time (user and
    system), in seconds."""
    wall: float
    cpu: float

    def __add__(self, other):
        return Run(self.wall + other.wall, self.cpu + other.cpu)


def timed(argv, env):
    """A run of argv from its start to its end (output to /dev/null)."""
    actions = [(os.POSIX_SPAWN_OPEN, 1, os.devnull, os.O_WRONLY, 0),
               (os.POSIX_SPAWN_OPEN, 2, os.devnull, os.O_WRONLY, 0)]
    start = time.perf_counter()
    pid = os.posix_spawn(argv[0], argv, env, file_actions=actions)
    _, status, usage = os.wait4(pid, 0)
    elapsed = time.perf_counter() - start
    code = os.waitstatus_to_exitcode(status)
    if code != 0:
        raise Failed(f"{' '.join(argv)} exited with {code}")
    return Run(elapsed, usage.ru_utime + usage.ru_stime)


def time_interleaved(cases, runs):
    """cases: {label: (env, [argv, ...], prepare)}; each case's argvs run one
    after the other, `runs` times, the cases taking turns (in reversed order
    every other round); `prepare` (or None) runs untimed before each round
    of a case. Returns {label: [Run of the round, ...]}."""
    times = {label: [] for label in cases}
    for i in range(runs):
        order = list(cases.items())
        if i % 2:
            order.reverse()
        for label, (env, argvs, prepare) in order:
            if prepare:
                prepare()
            times[label].append(sum((timed(argv, env) for argv in argvs), Run(0.0, 0.0)))
    return times


# How rarely chance may decide a wall-time verdict.
CHANCE = 0.001


def bound_rank(n):
    """The k for which the k-th smallest of n ratios bounds their true median
    from below (and the k-th largest from above) but for chance CHANCE: the
    largest k with P(Binomial(n, 1/2) < k) <= CHANCE; 0 when n is too small."""
    k, below = 0, 0.0
    while k < n:
        below += math.comb(n, k) / 2 ** n
        if below > CHANCE:
            break
        k += 1
    return k


@dataclass
class Spread:
    """A median and what bounds it (None: the runs are too few to tell)."""
    median: float
    low: float | None
    high: float | None

    @classmethod
    def of(cls, runs):
        """Wall times, with the fastest and slowest run."""
        walls = [r.wall for r in runs]
        return cls(statistics.median(walls), min(walls), max(walls))

    @classmethod
    def limit(cls, runs):
        """Wall times against a time limit: the low bound is the least
        processor time of a run. A single-threaded run takes at least its
        processor time, and the machine's load hardly moves that, while it
        may slow even the fastest run's wall time."""
        return cls(statistics.median(r.wall for r in runs), min(r.cpu for r in runs),
                   max(r.wall for r in runs))

    @classmethod
    def ratio(cls, num, den):
        """num/den of runs in rounds (num[i] and den[i] back to back): the
        median of the rounds' wall-time ratios and the bounds that load
        falling on either side at random crosses less than once in
        1/CHANCE times."""
        r = sorted(a.wall / b.wall for a, b in zip(num, den))
        k = bound_rank(len(r))
        return cls(statistics.median(r), r[k - 1] if k else None, r[-k] if k else None)

    def scaled(self, factor):
        return Spread(*(v * factor if v is not None else None
                        for v in (self.median, self.low, self.high)))
