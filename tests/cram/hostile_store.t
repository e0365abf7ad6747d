A host file that is not a usable host database: one line naming the file and
the cause, status 1, the file left as it was.

  $ . "$TESTDIR/setup.sh"
  $ try() { local f=$1; shift; local before=$(sha256sum < "$f"); orvocfg-vswitch "$@" > out 2> err; local st=$?; [ "$(sha256sum < "$f")" = "$before" ] && st="$st, unchanged"; echo "status $st, $(wc -l < err) line(s):"; sed "s|$PWD|PWD|" err; cat out; }

Another application's database (the other causes, and an empty file that
becomes the default host in place: the store test):

  $ sqlite3 other.db 'CREATE TABLE x(a); INSERT INTO x VALUES (1)'
  $ TARN_HOST_DB=$PWD/other.db try other.db -A pg1 vswitch0
  status 1, unchanged, 1 line(s):
  Cannot open host database PWD/other.db: not a host database (application id 0x0); set TARN_HOST_DB to a host file, or move it away and run tarnhost init

tarnhost refuses them the same way and does not replace them on init:

  $ TARN_HOST_DB=$PWD/other.db tarnhost init 2>&1 | sed "s|$PWD|PWD|"; sqlite3 other.db 'SELECT a FROM x'
  tarnhost: Cannot open host database PWD/other.db: not a host database (application id 0x0); set TARN_HOST_DB to a host file, or move it away and run tarnhost init
  1

A location where nothing can be written:

  $ TARN_HOST_DB=/proc/self/host.db orvocfg-vswitch -l; echo $?
  Cannot create host database /proc/self/host.db: No such file or directory; set TARN_HOST_DB to a file in a writable directory
  1

Failures of the disk say what happened once, whether the change stood, and
what is safe to do; a host that failed to open is never advised away. A
failed copy of a commit into the file: the change was made and waits in the
log, and the next program copies it in (strace fails the system call; leak
checks cannot run under it):

  $ export TARN_HOST_DB=$PWD/host.db; tarnhost init 2> /dev/null
  $ fail() { local how=$1; shift; ASAN_OPTIONS=${ASAN_OPTIONS:+$ASAN_OPTIONS:}detect_leaks=0 strace -f -o /dev/null -P "$PWD/host.db" -P "$PWD/host.db-wal" -e inject=$how "$@" 2>&1 | sed "s|$PWD|PWD|g"; echo "status ${PIPESTATUS[0]}"; }
  $ fail fdatasync:error=EIO:when=1 tarnhost pnic add pnicA
  tarnhost: Host database PWD/host.db: the change was made, but copying it from the log into the host file failed (disk I/O error): it waits in PWD/host.db-wal, and the next program to open the host copies it in
  status 1
  $ fail fdatasync:error=EIO:when=4 orvocfg-vswitch -a vSwitchA
  Host database PWD/host.db: the change was made, but copying it from the log into the host file failed (disk I/O error): it waits in PWD/host.db-wal, and the next program to open the host copies it in
  status 1
  $ tarnhost path 2>&1 | sed "s|$PWD|PWD|g"
  tarnhost: a commit waits in PWD/host.db-wal; copy the file together with it, or let any program open the host first, which copies it in
  PWD/host.db

A copy that fails again when the next program opens the host is left for
later, and reading goes on through the log:

  $ fail fdatasync:error=EIO:when=1 tarnhost pnic list | grep -E 'pnicA|status'; test -s host.db-wal && echo waits
  pnicA		 (esc)
  status 0
  waits
  $ tarnhost pnic list | grep -c pnicA; orvocfg-vswitch -c vSwitchA; stat -c %s host.db-wal; tarnhost path 2>&1 | sed "s|$PWD|PWD|g"
  1
  1
  0
  PWD/host.db
  $ fail pwrite64:error=ENOSPC:when=1 orvocfg-vswitch -A pgB vswitch0
  Host database PWD/host.db: database or disk is full; the change was not made (free space, then run it again)
  status 1
  $ fail pwrite64:error=EIO:when=1 tarnhost pnic add pnicB
  tarnhost: Host database PWD/host.db: disk I/O error; the change was not made
  status 1
  $ fail openat:error=EIO:when=2 orvocfg-vswitch -l
  Cannot open host database PWD/host.db: disk I/O error; the host was not changed; try again, and check the disk if it fails again
  status 1
  $ fail openat:error=EIO:when=3 orvocfg-vswitch -a vSwitchC
  Cannot open host database PWD/host.db: disk I/O error; the host was not changed; try again, and check the disk if it fails again
  status 1
  $ fail flock:error=EIO:when=1 tarnhost dump
  tarnhost: Cannot open host database PWD/host.db: cannot lock it: Input/output error; the host was not changed; try again, and check the disk if it fails again
  status 1
  $ ls host.db*; orvocfg-vswitch -l | grep -c pgB
  host.db
  host.db-wal
  0
  [1]

A host this user cannot write is read as it is (here as another user, in a
directory only root writes), and a change to it says why it cannot be made:

  $ mkdir ro; TARN_HOST_DB=$PWD/ro/host.db tarnhost init 2> /dev/null; chmod 444 ro/host.db; chmod 555 ro
  $ export TARN_HOST_DB=$PWD/ro/host.db; chmod o+x .. .; mkdir bin
  $ cp "$(command -v orvocfg-vswitch)" "$(command -v tarnhost)" bin/
  $ as() { setpriv --reuid=65534 --regid=65534 --clear-groups "bin/$@" 2>&1 | sed "s|$PWD|PWD|g"; }
  $ as orvocfg-vswitch -c vswitch0; as tarnhost dump | grep -c "\"name\": \"pnic0\""
  1
  1
  $ as orvocfg-vswitch -a vSwitchR; ls -A ro
  Failed to add vswitch: vSwitchR, Error: Host database PWD/ro/host.db: this user can only read it (the file, its log or their directory is not writable)
  host.db
  host.db-wal

A host of schema version 1 (faults without delays and counts) is read through
a view by a user who cannot write it, and brought to version 2 by the first
program that can:

  $ sqlite3 ro/host.db "ALTER TABLE fault DROP COLUMN delay_ms; ALTER TABLE fault DROP COLUMN pass;
  >   ALTER TABLE fault DROP COLUMN always; ALTER TABLE fault DROP COLUMN fired; PRAGMA user_version=1;
  >   INSERT INTO fault(operation, message, detail, skip, times) VALUES ('GetName', 'm', 'd', 0, 2)"
  $ as tarnhost fault list | tr '\t' '|'; sqlite3 ro/host.db 'PRAGMA user_version'
  1|GetName||0|2|"m"|"d"|0|||0|armed
  1
  $ tarnhost fault list | tr '\t' '|'; sqlite3 ro/host.db 'PRAGMA user_version'
  1|GetName||0|2|"m"|"d"|0|||0|armed
  2

A creation is all or nothing: the new host is built beside the file and
renamed into place, so a file that a killed creation left is no host yet and
is made again; a log beside a missing file is another host's, and is kept:

  $ cd ro; chmod 755 .; cd ..; export TARN_HOST_DB=$PWD/new.db
  $ : > new.db; echo partial > new.db.new; tarnhost init 2>&1 | sed "s|$PWD|PWD|"; ls new.db*
  created a new default host at PWD/new.db
  new.db
  new.db-wal
  $ cp host.db moved.db; printf 'frames' > moved.db-wal; rm moved.db; TARN_HOST_DB=$PWD/moved.db tarnhost init 2>&1 | sed "s|$PWD|PWD|g"; cat moved.db-wal; echo
  tarnhost: Cannot create host database PWD/moved.db: PWD/moved.db-wal holds changes of a host file that is not there (moved away without its log?); move the log to the host file it belongs to; nothing was changed
  frames
  $ ASAN_OPTIONS=detect_leaks=0 TARN_HOST_DB=$PWD/full.db strace -o /dev/null -P "$PWD/full.db" -e inject=openat:error=ENOSPC:when=2 tarnhost init 2>&1 | sed "s|$PWD|PWD|g"
  tarnhost: Cannot create host database PWD/full.db: No space left on device; the host was not changed; free space on its disk and try again
  $ sqlite3 half.db "PRAGMA application_id=$((0x54524e48)); PRAGMA user_version=1; CREATE TABLE pnic(x)"
  $ TARN_HOST_DB=$PWD/half.db orvocfg-vswitch -c vswitch0 2>&1 | sed "s|$PWD|PWD|g"
  created a new default host at PWD/half.db
  1
