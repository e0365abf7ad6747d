Argument checks and the dispatch chain of orvocfg-vswitch.

  $ . "$TESTDIR/setup.sh"
  $ tarnhost init
  $ export TARN_TRACE=$PWD/trace

Usage errors before anything is looked at: no option, and ENS switched on and
off at once (even behind a command option). The host is not touched.

  $ orvocfg-vswitch | head -1
  orvocfg-vswitch [options] [vswitch[:ports]]
  $ orvocfg-vswitch > /dev/null
  [1]
  $ orvocfg-vswitch -y -Y vswitch0 > /dev/null
  [1]
  $ orvocfg-vswitch -a -y -Y vswitch1 > /dev/null
  [1]
  $ test -e trace || echo untouched
  untouched

Missing arguments, each its own line and status 1.

  $ orvocfg-vswitch -a
  No virtual switch name specified
  [1]
  $ orvocfg-vswitch -a -Z
  No virtual switch name specified
  [1]
  $ orvocfg-vswitch -v 10 vswitch0
  No portgroup name specified. Specify with -p option
  [1]
  $ orvocfg-vswitch -M pnic1 vswitch0
  No portgroup name specified. Specify with -p option
  [1]
  $ orvocfg-vswitch -P pnic1 dvs0
  No DVPort ID specified. Specify with -V option
  [1]
  $ orvocfg-vswitch -T dvs0
  No DVPort ID specified. Specify with -V option
  [1]

Names of 32 characters or more are refused, except for the DVPort uplink
commands, which hand the name to the lookup.

  $ long=abcdefghijklmnopqrstuvwxyz012345
  $ orvocfg-vswitch -a $long
  Virtual switch name too long (should be < 32)
  [1]
  $ orvocfg-vswitch -c $long
  Virtual switch name too long (should be < 32)
  [1]
  $ orvocfg-vswitch -a ${long%5}
  $ orvocfg-vswitch -P pnic1 -V 1 $long
  GetDVSwitchByName: DVS abcdefghijklmnopqrstuvwxyz012345 does not exist on this host
  [1]
  $ grep -c "GetDVSwitchByName(\"$long\")" trace
  1

The port count follows the first ":" only with -a; elsewhere the colon is
part of the name.

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

--ens-ready sets the node and ends the run before any switch object exists,
whatever else was asked.

  $ rm trace
  $ orvocfg-vswitch -a -Z sw9
  $ cat trace
  NODI_CheckSig(out, 21, out)
  GetIntParamList(1, 0)
  NODI_Set(673, 0, [1], 0, 0)
  NODI_ParamListDestroy([1])

Modifiers alone take no step; -l ignores its operand.

  $ orvocfg-vswitch --portset=ps
  $ orvocfg-vswitch -l nosuch -S
  [1]

A lookup that finds nothing reaches the run-wide handler: the detailed
message alone, status 1.

  $ tarnhost fault add GetVirtualSwitchById --on nosuch --message short --detail 'nosuch: no such switch'
  $ orvocfg-vswitch -L pnic1 nosuch
  nosuch: no such switch
  [1]

ENS options run after the command in the same run; the status is the
command's. A failed add still lets ENS be activated on the existing switch.

  $ rm trace
  $ orvocfg-vswitch -a -y vs1
  $ grep -o -e '^AddVirtualSwitch.*"vs1", 128)$' -e '^GetPortsetById.*' -e '^ActivateEns.*' trace | sed 's/(.*"vs1", 128)/(... "vs1", 128)/'
  AddVirtualSwitch(... "vs1", 128)
  GetPortsetById("vs1")
  ActivateEns(false, false) on vs1
  $ orvocfg-vswitch -a -y -i vs1
  Failed to add vswitch: vs1, Error: Virtual switch vs1 already exists
  [1]
  $ grep -c 'ActivateEns(true, false) on vs1' trace
  1

-m falls back to the distributed switch silently when no standard switch has
the name; with neither, the second lookup's failure is reported.

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
