"""Prints the examples of one section of a Markdown document as a cram
transcript, so that a test runs them as the document shows them: the
section's indented lines ("$ command", "> continued", output) are the
transcript, its prose the comments.

Usage: doc_transcript.py FILE HEADING [LEFT_OUT...]
A command that begins with a LEFT_OUT text is left out, with its output."""
import re
import sys

path, heading, *left_out = sys.argv[1:]
lines = open(path).read().split("\n")
start = next(i for i, line in enumerate(lines) if re.fullmatch(r"#+ " + re.escape(heading), line))
level = lines[start].index(" ")
skipping = False
for line in lines[start + 1:]:
    if re.match(r"#{1,%d} " % level, line):
        break
    if line.startswith("    "):
        if line.startswith("    $ "):
            skipping = any(line[6:].startswith(text) for text in left_out)
        if not skipping:
            print(line[2:])
    else:
        print(line.lstrip())
