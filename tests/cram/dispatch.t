Argument checks and the dispatch chain of orvocfg-vswitch.

  $ . "$TESTDIR/setup.sh" init trace

Usage errors (no option; ENS on and off at once) leave the host untouched.

  $ for a in '' '-y -Y vswitch0' '-a -y -Y vswitch1'; do
  >   orvocfg-vswitch $a > /dev/null; echo "status $?"; done | uniq -c
        3 status 1
  $ test -e trace || echo untouched
  untouched

Every command that needs a switch name ends the run without one, and with
one of 32 characters or more but for the DVPort uplink commands, which look
it up; a missing -p or -V has its own line. Status 1 each.

  $ long=abcdefghijklmnopqrstuvwxyz012345
  $ for a in -a -d '-L p' '-U p' '-A g' '-D g' -c '-v 1 -p g' '-B down' -b '-m 1' '-T -V 1' -x \
  >     '-X 1' '-M u -p g' '-N u -p g' '-P u -V 1' '-Q u -V 1' -y -Y -z -f '-a -Z'; do
  >   for name in '' $long; do orvocfg-vswitch $a $name 2>&1 | cut -d: -f1; echo "status ${PIPESTATUS[0]}"; done
  > done | paste -d' ' - - | sort | uniq -c
        2 GetDVSwitchByName status 1
       23 No virtual switch name specified status 1
       21 Virtual switch name too long (should be < 32) status 1
  $ grep -c "GetDVSwitchByName(\"$long\")" trace
  2
  $ for a in '-v 10' '-M pnic1' '-N pnic1' '-P pnic1' '-Q pnic1' -T; do
  >   orvocfg-vswitch $a vswitch0 2>&1; echo "status $?"; done | paste -d' ' - - | uniq -c
        3 No portgroup name specified. Specify with -p option status 1
        3 No DVPort ID specified. Specify with -V option status 1
  $ orvocfg-vswitch -a ${long%5}

The port count follows the first ":" only with -a; elsewhere it is in the name.

  $ rm trace
  $ orvocfg-vswitch -a sw1:0x40 && orvocfg-vswitch -a sw4:010 && orvocfg-vswitch -a sw5
  $ orvocfg-vswitch -a sw2:abc; orvocfg-vswitch -a sw3:
  Failed to add vswitch: sw2, Error: Invalid number of ports 0
  Failed to add vswitch: sw3, Error: Invalid number of ports 0
  [1]
  $ grep -o '"sw[0-9]", [0-9]*)$' trace
  "sw1", 64)
  "sw4", 8)
  "sw5", 128)
  "sw2", 0)
  "sw3", 0)
  $ orvocfg-vswitch -d sw1:64
  Not a valid virtual switch or it is a DVSwitch: sw1:64
  [1]

--ens-ready sets the node and ends the run with 0, whatever else was asked.

  $ rm trace
  $ orvocfg-vswitch -a -Z sw9
  $ cut -d'(' -f1 trace | paste -sd' '
  NODI_CheckSig GetIntParamList NODI_Set NODI_ParamListDestroy

Modifiers alone take no step; -l ignores its operand.

  $ orvocfg-vswitch --portset=ps
  $ orvocfg-vswitch -l nosuch -S
  [1]

A lookup that finds nothing: the run-wide handler's detailed message alone.

  $ tarnhost fault add GetVirtualSwitchById --on nosuch --message short --detail 'nosuch: no such switch'
  $ orvocfg-vswitch -L pnic1 nosuch
  nosuch: no such switch
  [1]

ENS options run after the command, even a failed one; the status is the command's.

  $ rm trace
  $ orvocfg-vswitch -a -y -i vswitch0
  Failed to add vswitch: vswitch0, Error: Virtual switch vswitch0 already exists
  [1]
  $ grep -e '^GetPortsetById' -e '^ActivateEns' trace
  GetPortsetById("vswitch0")
  ActivateEns(true, false) on vswitch0

-m falls back silently to a distributed switch; with neither, the second
lookup's failure is reported.

  $ tarnhost dvs add dvs0
  $ rm trace
  $ orvocfg-vswitch -m 9000 dvs0
  $ grep -e ById -e ByName -e SetMTU trace
  GetVirtualSwitchById("dvs0", 0)
  GetDVSwitchByName("dvs0")
  SetMTU(9000) on dvs0
  $ tarnhost fault add GetDVSwitchByName --detail 'dvs lookup failed'
  $ orvocfg-vswitch -m 9000 nosuch
  dvs lookup failed
  [1]

Standard output that cannot be written: one line on standard error and status
1, for each command that prints. The same runs that can write are unchanged,
and a command that prints nothing is not affected. The usage text, as help or
after a usage error, is not checked: its status stays.

  $ tarnhost timeout uplink vswitch0 uplink1 1 1 && orvocfg-vswitch -O -s vswitch0
  $ for out in /dev/full /dev/null; do
  >   for a in -l '-c vswitch0' '-C Management' '-b vswitch0' '-x vswitch0' -o; do
  >     err=$(orvocfg-vswitch $a 2>&1 > $out); echo "$out: ${err:-no error}, status $?"
  >   done
  > done | uniq -c
        6 /dev/full: orvocfg-vswitch: error writing standard output: No space left on device, status 1
        6 /dev/null: no error, status 0
  $ orvocfg-vswitch -a vswitch7 > /dev/full
  $ for a in -h -t '-a -a vs1'; do orvocfg-vswitch $a > /dev/full; echo "status $?"; done
  status 0
  status 1
  Error, only one command can be performed at a time.
  status 1
