Forced reassociation signals the device manager named by its fixed PID file,
which this test owns while it runs and leaves nothing behind.

  $ . "$TESTDIR/setup.sh" trace
  $ dir=/var/run/halden pidfile=/var/run/halden/tarndevmgr.pid made= pid=
  $ if [ -e "$pidfile" ]; then exit 80; fi
  $ cleanup() {
  >   [ -n "$pid" ] && kill "$pid" 2>/dev/null
  >   rm -f "$pidfile"
  >   [ -n "$made" ] && rmdir "$dir"
  > }
  $ trap cleanup EXIT
  $ if [ ! -d "$dir" ]; then mkdir -p "$dir" 2>/dev/null || exit 80; made=1; fi
  $ [ -w "$dir" ] || exit 80

No PID file: the message goes to standard output and nothing is reassociated.

  $ orvocfg-vswitch -f vswitch0 2>/dev/null; echo "status $?"
  Failed to open /var/run/halden/tarndevmgr.pid
  status 1
  $ calls ReassociateEnsUplinks
  [1]

A process of this test stands in for the device manager.

  $ sleep 120 & pid=$!

A PID file that cannot name a single process: 0, no number first (a sign
included), a value at or above the largest process id or beyond 32 bits
(also one that wraps to the sleeper's PID). Nothing is signalled and nothing
is reassociated.

  $ for text in 0 '' abc x1 0x10 "$(cat /proc/sys/kernel/pid_max)" 2147483648 4294967296 \
  >     "+$pid" "-$pid" " -$pid" "-$((4294967296 - pid))" "$((4294967296 + pid))"; do
  >   printf '%s\n' "$text" > "$pidfile"
  >   orvocfg-vswitch -f vswitch0 2>/dev/null; echo "status $?"
  > done | paste -d' ' - - | uniq -c
       13 Failed to read device manager PID status 1
  $ kill -0 "$pid" && echo "sleeper still running"
  sleeper still running
  $ calls ReassociateEnsUplinks
  [1]

The number at the start, after white space, names the process whatever
follows it: each PID file below sends SIGHUP to a sleeper of its own (the
shell's notes of their ends left out), and the reassociation is forced.

  $ for format in ' \n  %s \n\n' '%s' '00%s' '%sabc' '%s 7\n' '%s.0' '%s-1\n'; do
  >   printf "$format" "$pid" > "$pidfile"
  >   orvocfg-vswitch -f vswitch0; wait "$pid" 2>/dev/null; echo "sleeper ended with $?"
  >   sleep 120 & pid=$!
  > done > ended 2>&1; grep -v Hangup ended | uniq -c
        7 sleeper ended with 129
  $ calls ReassociateEnsUplinks | uniq -c
        7 ReassociateEnsUplinks(false, true, 0, 0) on vswitch0
