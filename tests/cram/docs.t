The examples of the documentation, run as they are written: each section
becomes a transcript of its own, on a default host of its own.

  $ check() { n=$((n + 1)); export TARN_HOST_DB=$PWD/$n.db; tarnhost init 2> /dev/null
  >   python3 "$TESTDIR/doc_transcript.py" "$TESTDIR/../../docs/$@" > $n.t &&
  >   "$(command -v cram3 || command -v cram)" --shell=/bin/bash $n.t; }
  $ check host.md "A first session"
  .
  # Ran 1 tests, 0 skipped, 0 failed.
  $ check host.md JSON
  .
  # Ran 1 tests, 0 skipped, 0 failed.
  $ check dump.md "Editing a dump"
  .
  # Ran 1 tests, 0 skipped, 0 failed.
  $ check testing.md "A worked example"
  .
  # Ran 1 tests, 0 skipped, 0 failed.
  $ check host.md Faults
  .
  # Ran 1 tests, 0 skipped, 0 failed.
  $ check host.md "The JSON trace"
  .
  # Ran 1 tests, 0 skipped, 0 failed.
