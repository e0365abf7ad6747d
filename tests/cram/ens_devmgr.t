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

-z does not read the file.

  $ orvocfg-vswitch -z vswitch0
  $ calls ReassociateEnsUplinks
  ReassociateEnsUplinks(false, false, 0, 0) on vswitch0

A process of this test stands in for the device manager.

  $ (sleep 120 & echo $! > sleeper; wait $!; echo "sleep ended with $?" > ended) 2>/dev/null &
  $ until [ -s sleeper ]; do sleep 0.1; done; pid=$(cat sleeper)

A PID file that is not plain decimal digits naming a single process: 0, no
number, too large, over 32 bits, and the sleeper's PID with a sign, with
characters after it, or written as a negative or wider number that wraps to
it. Nothing is signalled and nothing is reassociated.

  $ for text in 0 '' abc 0x10 "$(cat /proc/sys/kernel/pid_max)" 2147483648 4294967296 \
  >     "+$pid" "-$((4294967296 - pid))" "$((4294967296 + pid))" "${pid}x" "$pid $pid" "$pid.0"; do
  >   printf '%s\n' "$text" > "$pidfile"
  >   orvocfg-vswitch -f vswitch0 2>/dev/null; echo "status $?"
  > done | paste -d' ' - - | uniq -c
       13 Failed to read device manager PID status 1
  $ kill -0 "$pid" && echo "sleeper still running"
  sleeper still running
  $ calls ReassociateEnsUplinks
  [1]

Its PID, with white space around it, gets SIGHUP, and the reassociation is
forced.

  $ printf ' \n  %s \n\n' "$pid" > "$pidfile"
  $ orvocfg-vswitch -f vswitch0
  $ wait; pid=; cat ended
  sleep ended with 129
  $ calls ReassociateEnsUplinks
  ReassociateEnsUplinks(false, true, 0, 0) on vswitch0
