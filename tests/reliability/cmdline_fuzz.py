#!/usr/bin/env python3
"""Random command lines against the real binary.

Draws command lines from the option table (arguments empty, very long,
non-UTF-8, numbers at and past every limit). Every run must exit 0 or 1
without a sanitizer report, end each line written with a newline, and leave
the host byte for byte unchanged when it made no library call.

usage: cmdline_fuzz.py BIN_DIR COUNT [SEED]
"""
import os
import random
import re
import subprocess
import sys
import tempfile
from concurrent.futures import ThreadPoolExecutor
from pathlib import Path

# (short, long, takes an argument), read from the parser's own table so that
# every option it knows gets drawn.
OPTIONS_SOURCE = os.path.join(os.path.dirname(os.path.abspath(__file__)), "../../src/cli/options.cc")
with open(OPTIONS_SOURCE) as source:
    OPTIONS = [(m[0], m[1], m[2] == "kArg") for m in
               re.findall(r"\{'([A-Za-z])', +\"([a-z-]+)\", +(kArg|kNoArg)", source.read())]

NUMBERS = ["0", "1", "-1", "4095", "4096", "0xfff", "0x1000", "07777", "2147483647",
           "2147483648", "-2147483648", "-2147483649", "4294967295", "4294967296",
           "18446744073709551615", "18446744073709551616", "65535", "65536", "70000",
           "1280", "9000", "12abc", " 5", "0x", "-", "+3", "99999999999999999999999"]
NAMES = ["vswitch0", "vs1", "Management", "pg1", "ALL", "all", "pnic0", "pnic1", "pnic9",
         "dvs0", "100", "cswitch", "etherswitch", "print", "down", "listen", "advertise",
         "both", "00 11 22 33 44 55 66 77-88 99 aa bb cc dd ee ff", "0123456789abcdef"]


def random_text(rng):
    kind = rng.randrange(8)
    if kind == 0:
        return b""
    if kind == 1:
        return rng.choice(NUMBERS).encode()
    if kind == 2:
        return (rng.choice("abcdefghij") * rng.choice([31, 32, 33, 40, 200, 5000])).encode()
    if kind == 3:
        return bytes(rng.randrange(1, 256) for _ in range(rng.randrange(1, 24)))
    if kind == 4:
        return (rng.choice(NAMES) + ":" + rng.choice(NUMBERS)).encode()
    return rng.choice(NAMES).encode()


def random_option(rng):
    short, long_name, takes = rng.choice(OPTIONS)
    style = rng.randrange(4)
    if not takes:
        return [("-" + short).encode() if style < 2 else ("--" + long_name).encode()]
    arg = random_text(rng)
    if style == 0:
        return [("-" + short).encode(), arg]
    if style == 1:
        return [("-" + short).encode() + arg] if arg else [("-" + short).encode(), arg]
    if style == 2:
        return [("--" + long_name + "=").encode() + arg]
    return [("--" + long_name).encode(), arg]


def random_command_line(rng):
    words = []
    for _ in range(rng.choice([0, 1, 1, 1, 2, 2, 3, 4])):
        words += random_option(rng)
    for _ in range(rng.choice([0, 1, 1, 2])):
        words.insert(rng.randrange(len(words) + 1), random_text(rng))
    if rng.random() < 0.05:
        words.insert(rng.randrange(len(words) + 1), b"--")
    if rng.random() < 0.05:
        words.append(rng.choice([b"-t", b"--bogus", b"--get-uplink-timeout", b"-q"]))
    return words


def run_worker(worker, bin_dir, count, seed, failures, statuses):
    rng = random.Random(seed * 1000 + worker)
    tool = os.path.join(bin_dir, "orvocfg-vswitch")
    tarnhost = os.path.join(bin_dir, "tarnhost")
    with tempfile.TemporaryDirectory() as tmp:
        db, trace = os.path.join(tmp, "host.db"), os.path.join(tmp, "trace")
        env = dict(os.environ, TARN_HOST_DB=db, TARN_TRACE=trace, TARN_LOCK_TIMEOUT="60",
                   ASAN_OPTIONS="detect_leaks=1:abort_on_error=0:exitcode=99",
                   UBSAN_OPTIONS="print_stacktrace=1:halt_on_error=1:exitcode=98")
        for i in range(count):
            if i % 500 == 0:
                subprocess.run([tarnhost, "init"], env=env, check=True)
            before = Path(db).read_bytes()
            Path(trace).write_bytes(b"")
            argv = random_command_line(rng)
            proc = subprocess.run([tool] + argv, env=env, capture_output=True, timeout=120)
            statuses[proc.returncode] = statuses.get(proc.returncode, 0) + 1
            problems = []
            if proc.returncode not in (0, 1):
                problems.append("exit status %d" % proc.returncode)
            for name, data in (("stdout", proc.stdout), ("stderr", proc.stderr)):
                if data and not data.endswith(b"\n"):
                    problems.append(name + " does not end with a newline")
            if b"Sanitizer" in proc.stderr or b"runtime error:" in proc.stderr:
                problems.append("sanitizer report")
            if os.path.getsize(trace) == 0 and Path(db).read_bytes() != before:
                problems.append("host changed by a run that made no library call")
            if problems:
                failures.append((argv, proc.returncode, problems, proc.stderr[-2000:]))
                if len(failures) > 20:
                    return


def main():
    if len(sys.argv) < 3:
        sys.exit(__doc__)
    bin_dir, count = sys.argv[1], int(sys.argv[2])
    seed = int(sys.argv[3]) if len(sys.argv) > 3 else random.randrange(1 << 30)
    workers = 2
    failures = []
    statuses = {}
    with ThreadPoolExecutor(workers) as pool:
        futures = [pool.submit(run_worker, w, bin_dir, count // workers, seed, failures,
                               statuses)
                   for w in range(workers)]
        for future in futures:
            future.result()
    for argv, status, problems, err in failures[:20]:
        print("FAIL", [a.decode("utf-8", "backslashreplace") for a in argv], status, problems)
        print(err.decode("utf-8", "backslashreplace"))
    total = count // workers * workers
    print("seed %d: %d command lines, exit statuses %s" % (seed, total, sorted(statuses.items())))
    print("%d passed, %d failed" % (total - len(failures), len(failures)))
    sys.exit(1 if failures else 0)


if __name__ == "__main__":
    main()
