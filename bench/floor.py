"""The floor under `orvocfg-vswitch -c vswitch0`: what starting a program,
opening the host with SQLite and reading its schema cost by themselves.

Each step is a whole run against /bin/true, timed as bench/run.py times
(rounds, one run of each case back to back, the order turning every
round; the median of the rounds' ratios, with the bounds that chance
crosses less than once in a thousand). The C programs are built here,
statically and position-independent like the tool, with the system's
SQLite:

    python3 bench/floor.py build/bin [ROUNDS]     # ROUNDS defaults to 150
"""
import os
import sqlite3
import subprocess
import sys
import tempfile

from hosts import new_host
from measure import Spread, time_interleaved

EMPTY_C = "int main(void) { return 0; }\n"

# Opens FILE; with a second argument reads its schema too, the log (if the
# file uses one) locked exclusively and kept, as the library does.
OPEN_C = r"""
#include <sqlite3.h>
int main(int argc, char** argv) {
  sqlite3* db;
  if (sqlite3_open_v2(argv[1], &db, SQLITE_OPEN_READWRITE, 0) != SQLITE_OK) return 2;
  if (argc > 2) {
    int keep = 1;
    sqlite3_file_control(db, "main", SQLITE_FCNTL_PERSIST_WAL, &keep);
    sqlite3_stmt* select;
    if (sqlite3_exec(db, "PRAGMA locking_mode=EXCLUSIVE", 0, 0, 0) != SQLITE_OK ||
        sqlite3_prepare_v2(db, "SELECT 1 FROM sqlite_schema", -1, &select, 0) != SQLITE_OK)
      return 3;
    while (sqlite3_step(select) == SQLITE_ROW) {}
    sqlite3_finalize(select);
  }
  return sqlite3_close(db) == SQLITE_OK ? 0 : 4;
}
"""


def build(work, name, source, *libs):
    path = os.path.join(work, name)
    with open(path + ".c", "w") as f:
        f.write(source)
    subprocess.run(["cc", "-O2", "-fPIE", "-static-pie", "-o", path, path + ".c", *libs],
                   check=True, stderr=subprocess.DEVNULL)
    return path


def one_table_host(path, journal):
    with sqlite3.connect(path) as db:
        db.execute("CREATE TABLE t(a)")
        db.execute(f"PRAGMA journal_mode={journal}")


def main():
    bin_dir = sys.argv[1]
    rounds = int(sys.argv[2]) if len(sys.argv) > 2 else 150
    tool = os.path.join(bin_dir, "orvocfg-vswitch")
    with tempfile.TemporaryDirectory() as work:
        empty = build(work, "empty", EMPTY_C)
        opener = build(work, "open", OPEN_C, "-lsqlite3", "-lm")
        env = new_host(os.path.join(bin_dir, "tarnhost"), os.path.join(work, "default"))
        host = env["TARN_HOST_DB"]
        rollback, logged = os.path.join(work, "rollback.db"), os.path.join(work, "logged.db")
        one_table_host(rollback, "DELETE")
        one_table_host(logged, "WAL")
        steps = [
            ("/bin/true", ["/bin/true"]),
            ("an empty C program, static", [empty]),
            ("orvocfg-vswitch -h (no host opened)", [tool, "-h"]),
            ("C: SQLite opens the host, reads nothing", [opener, host]),
            ("C: reads a one-table schema, rollback journal", [opener, rollback, "read"]),
            ("C: reads a one-table schema, log", [opener, logged, "read"]),
            ("C: reads the host's schema, log", [opener, host, "read"]),
            ("orvocfg-vswitch -c vswitch0", [tool, "-c", "vswitch0"]),
        ]
        times = time_interleaved({label: (env, [argv], None) for label, argv in steps}, rounds)
        base = times["/bin/true"]
        width = max(len(label) for label, _ in steps)
        for label, _ in steps:
            s = Spread.ratio(times[label], base)
            bounds = f" [{s.low:.2f}x-{s.high:.2f}x]" if s.low is not None else ""
            print(f"{label.ljust(width)}  {s.median:.2f}x{bounds}")
        print(f"/bin/true median {Spread.of(base).median * 1000:.2f} ms, {rounds} rounds")


if __name__ == "__main__":
    main()
