#!/usr/bin/env python3
"""Checks that each layer of the host library includes only headers of its
own layer and of the layers below it (store < instrument < model < api <
admin), and that nothing in it names SQLite outside the store."""
import pathlib
import re
import sys

LAYERS = ["store", "instrument", "model", "api", "admin"]
INCLUDE = re.compile(r'#include\s+[<"]([^">]+)[">]')


def main(root):
    root = pathlib.Path(root)
    problems = []
    for rank, layer in enumerate(LAYERS):
        for path in sorted((root / layer).rglob("*")):
            if path.suffix not in (".h", ".cc"):
                continue
            for number, line in enumerate(path.read_text().splitlines(), 1):
                match = INCLUDE.search(line)
                if not match:
                    continue
                header = match.group(1)
                where = f"{path.relative_to(root)}:{number}: {header}"
                parts = header.split("/")
                if parts[0] == "tarnctl":
                    if len(parts) < 3 or parts[1] not in LAYERS:
                        problems.append(f"{where} is in no layer")
                    elif LAYERS.index(parts[1]) > rank:
                        problems.append(f"{where} is of a higher layer ({parts[1]})")
                if header.startswith("sqlite3") and layer != "store":
                    problems.append(f"{where}: SQLite outside the store")
    for problem in problems:
        print(problem)
    return 1 if problems else 0


if __name__ == "__main__":
    sys.exit(main(sys.argv[1]))
