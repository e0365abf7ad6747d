A host file that is not a usable host database: one line naming the file and
the cause, status 1, the file left as it was.

  $ . "$TESTDIR/setup.sh"
  $ try() { local f=$1; shift; local before=$(sha256sum < "$f"); orvocfg-vswitch "$@" > out 2> err; local st=$?; [ "$(sha256sum < "$f")" = "$before" ] && st="$st, unchanged"; echo "status $st, $(wc -l < err) line(s):"; sed "s|$PWD|PWD|" err; cat out; }

Another application's database (the other causes, each in its words: the
store test), and an empty file, which becomes the default host in place:

  $ sqlite3 other.db 'CREATE TABLE x(a); INSERT INTO x VALUES (1)'
  $ TARN_HOST_DB=$PWD/other.db try other.db -A pg1 vswitch0
  status 1, unchanged, 1 line(s):
  Cannot open host database PWD/other.db: not a host database (application id 0x0); set TARN_HOST_DB to a host file, or move it away and run tarnhost init
  $ : > empty.db
  $ TARN_HOST_DB=$PWD/empty.db try empty.db -c vswitch0
  status 0, 1 line(s):
  created a new default host at */empty.db (glob)
  1

tarnhost refuses them the same way and does not replace them on init:

  $ TARN_HOST_DB=$PWD/other.db tarnhost init 2>&1 | sed "s|$PWD|PWD|"; sqlite3 other.db 'SELECT a FROM x'
  tarnhost: Cannot open host database PWD/other.db: not a host database (application id 0x0); set TARN_HOST_DB to a host file, or move it away and run tarnhost init
  1

A location where nothing can be written:

  $ TARN_HOST_DB=/proc/self/host.db orvocfg-vswitch -l; echo $?
  Cannot create host database /proc/self/host.db: No such file or directory; set TARN_HOST_DB to a file in a writable directory
  1
