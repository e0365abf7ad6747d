"""Checks that the bash completion offers exactly, and the man page lists
exactly, the commands and options of tarnhost's command table, as
`tarnhost help` lists it, and the operations `tarnhost fault ops` lists. Prints each difference, then what was compared.

Usage: tarnhost_table.py SOURCE_DIR (tarnhost on the PATH)"""
import itertools
import re
import subprocess
import sys

root = sys.argv[1]
table = {}  # command words -> options
for line in subprocess.run(["tarnhost", "help"], capture_output=True, text=True).stdout.split("\n"):
    if re.match(r"  \S", line):
        synopsis = line[2:].split("  ")[0]
        words = itertools.takewhile(lambda t: re.fullmatch(r"(--)?[a-z][a-z-]*", t), synopsis.split())
        table[tuple(words)] = set(re.findall(r"\[(--[a-z-]+)", synopsis))
problems = []


def expect(what, got, want):
    extra, missing = set(got) - set(want), set(want) - set(got)
    if extra or missing:
        problems.append(f"{what}: {sorted(extra)} not in the table, {sorted(missing)} missing")


def complete(*words):
    script = (f'source "{root}/completions/tarnhost"; COMP_WORDS=(tarnhost "$@"); COMP_CWORD=$#; '
              '_tarnhost tarnhost; printf "%s\\n" "${COMPREPLY[@]}"')
    run = subprocess.run(["bash", "-c", script, "_", *words], capture_output=True, text=True)
    return run.stdout.split()


for prefix in sorted({c[:i] for c in table for i in range(len(c))}):
    following = {c[len(prefix)] for c in table if c[:len(prefix)] == prefix}
    for typed in ("", "-"):
        expect(f"completion of {' '.join(prefix + (typed,))}", complete(*prefix, typed),
               {w for w in following if w.startswith("-") == (typed == "-")})
for command, options in table.items():
    expect(f"completion of {' '.join(command)} --", complete(*command, "--"), options)

# Under COMMANDS, a command's tag is .TP, then a font macro with its words quoted.
man = {}
lines = open(f"{root}/docs/man/tarnhost.8.in").read().split("\n")
start = lines.index(".SH COMMANDS")
end = next(i for i in range(start + 1, len(lines)) if lines[i].startswith(".SH"))
command = None
for before, line in zip(lines[start:end], lines[start + 1:end]):
    tag = re.match(r'\.B[IR]? "([^"]+)"', line)
    if before == ".TP" and tag:
        command = tuple(tag[1].replace("\\-", "-").split())
        man[command] = set()
    if command:
        options = re.findall(r"\\-\\-[a-z](?:[a-z]|\\-)*", line)
        man[command] |= {o.replace("\\-", "-") for o in options} - {"--help", *command}
expect("man page commands", man, table)
for command in set(man) & set(table):
    expect(f"man page options of {' '.join(command)}", man[command], table[command])

# The operations: the man page names each one `fault ops` lists, and the
# completion of `fault add` offers exactly those a fault can make fail.
ops = [line.split("\t") for line in
       subprocess.run(["tarnhost", "fault", "ops"], capture_output=True, text=True).stdout.splitlines()]
listed = re.search(r"The operations, as the host control interface names them:\n(.*?)\.\n",
                   "\n".join(lines), re.S)
expect("man page operations", re.split(r",\s*", listed[1]) if listed else [], [op[0] for op in ops])
expect("completion of fault add", complete("fault", "add", ""), [op[0] for op in ops if op[1] == "yes"])

for problem in problems:
    print(problem)
print(f"{len(table)} commands, {sum(map(len, table.values()))} options, {len(ops)} operations compared")
