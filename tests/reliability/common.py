"""What the reliability scripts share: a scratch host of their own, its
dump, and the closing report (the host is kept when something failed)."""
import json
import os
import shutil
import subprocess
import sys
import tempfile


class Host:
    def __init__(self, bin_dir, prefix):
        self.tool = os.path.join(bin_dir, "orvocfg-vswitch")
        self.tarnhost = os.path.join(bin_dir, "tarnhost")
        self.work = tempfile.mkdtemp(prefix=prefix)
        self.db = os.path.join(self.work, "host.db")
        self.env = dict(os.environ, TARN_HOST_DB=self.db)
        self.env.pop("TARN_TRACE", None)
        self.env.pop("TARN_LOCK_TIMEOUT", None)  # the default wait is part of the tests

    def run(self, *args):
        return self.run_as(self.db, *args)

    def run_as(self, db, *args):
        """Runs with the host reached through the path `db`."""
        return subprocess.run(args, env=dict(self.env, TARN_HOST_DB=db), capture_output=True,
                              text=True, errors="replace")

    def must(self, *args):
        r = self.run(*args)
        if r.returncode != 0:
            sys.exit(f"setup failed: {' '.join(args)}: {r.stderr.strip()}")

    def dump(self):
        """The host's dump; a host that does not open fails the test."""
        dump = self.run(self.tarnhost, "dump")
        if dump.returncode != 0:
            self.finish("", [f"the host does not open: {dump.stderr.strip()}"])
        return json.loads(dump.stdout)

    def finish(self, summary, failures):
        if summary:
            print(summary)
        for f in failures[:20]:
            print("FAIL:", f)
        if failures:
            print("host kept in", self.work)
            sys.exit(1)
        shutil.rmtree(self.work)


def names(rows, layer, **match):
    """Names of the rows of one layer whose fields have the given values."""
    return {r["name"] for r in rows
            if r["layer"] == layer and all(r[k] == v for k, v in match.items())}
