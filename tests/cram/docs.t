The examples of the documentation, run as they are written: each section
becomes a transcript of its own, on a default host of its own. (The del
verbs are not in tarnhost yet: the first session's "tarnhost client del"
step is left out.)

  $ check() { n=$((n + 1)); export TARN_HOST_DB=$PWD/$n.db; tarnhost init 2> /dev/null
  >   python3 "$TESTDIR/doc_transcript.py" "$TESTDIR/../../docs/$@" > $n.t &&
  >   "$(command -v cram3 || command -v cram)" --shell=/bin/bash $n.t; }
  $ check host.md "A first session" "tarnhost client del"
  .
  # Ran 1 tests, 0 skipped, 0 failed.
  $ check host.md JSON
  .
  # Ran 1 tests, 0 skipped, 0 failed.
  $ check dump.md "Editing a dump"
  .
  # Ran 1 tests, 0 skipped, 0 failed.
