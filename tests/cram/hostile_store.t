A host file that is not a usable host database: one line naming the file and
the cause, status 1, the file left as it was.

  $ . "$TESTDIR/setup.sh"
  $ try() { local f=$1; shift; local before=$(sha256sum < "$f"); orvocfg-vswitch "$@" > out 2> err; local st=$?; [ "$(sha256sum < "$f")" = "$before" ] && st="$st, unchanged"; echo "status $st, $(wc -l < err) line(s):"; sed "s|$PWD|PWD|" err; cat out; }

Another application's database, a newer schema, text, empty, truncated:

  $ sqlite3 other.db 'CREATE TABLE x(a); INSERT INTO x VALUES (1)'
  $ TARN_HOST_DB=$PWD/other.db try other.db -A pg1 vswitch0
  status 1, unchanged, 1 line(s):
  Cannot open host database PWD/other.db: not a host database (application id 0x0); set TARN_HOST_DB to a host file, or move it away and run tarnhost init

  $ tarnhost init && cp host.db newer.db && sqlite3 newer.db 'PRAGMA user_version=2'
  created a new default host at */host.db (glob)
  $ TARN_HOST_DB=$PWD/newer.db try newer.db -a vs1
  status 1, unchanged, 1 line(s):
  Cannot open host database PWD/newer.db: schema version 2 is newer than this library's 1; use the newer release that made it, or set TARN_HOST_DB to another host file

  $ printf 'not a database %.0s' $(seq 300) > text.db
  $ TARN_HOST_DB=$PWD/text.db try text.db -l
  status 1, unchanged, 1 line(s):
  Cannot open host database PWD/text.db: not a host database (not an SQLite database); set TARN_HOST_DB to a host file, or move it away and run tarnhost init

  $ : > empty.db
  $ TARN_HOST_DB=$PWD/empty.db try empty.db -c vswitch0
  status 0, 1 line(s):
  created a new default host at */empty.db (glob)
  1

  $ cp host.db cut.db && truncate -s 4096 cut.db
  $ TARN_HOST_DB=$PWD/cut.db try cut.db -L pnic1 vswitch0
  status 1, unchanged, 1 line(s):
  Cannot open host database PWD/cut.db: database disk image is malformed; set TARN_HOST_DB to a host file, or move it away and run tarnhost init

tarnhost refuses them the same way and does not replace them on init:

  $ TARN_HOST_DB=$PWD/other.db tarnhost init 2>&1 | sed "s|$PWD|PWD|"; sqlite3 other.db 'SELECT a FROM x'
  tarnhost: Cannot open host database PWD/other.db: not a host database (application id 0x0); set TARN_HOST_DB to a host file, or move it away and run tarnhost init
  1

A location where nothing can be written:

  $ TARN_HOST_DB=/proc/self/host.db orvocfg-vswitch -l; echo $?
  Cannot create host database /proc/self/host.db: No such file or directory; set TARN_HOST_DB to a file in a writable directory
  1
