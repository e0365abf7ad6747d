Port groups of a standard switch (-A, -D, -v with -p).

  $ . "$TESTDIR/setup.sh" init
  $ vlans() { orvocfg-vswitch -l | awk '/^  [A-Za-z]/ && $1 != "PortGroup" {print $1, $2}'; }

The last of -A and -p names the port group; "ALL" is an ordinary name here.

  $ orvocfg-vswitch -A pg1 vswitch0
  $ orvocfg-vswitch -A pg9 -p pg2 vswitch0
  $ orvocfg-vswitch -A ALL vswitch0
  $ orvocfg-vswitch -D ALL vswitch0
  $ vlans
  Management 0
  pg1 0
  pg2 0

Refusals by the library.

  $ orvocfg-vswitch -A pg1 vswitch0
  Failed to add portgroup: pg1 to vswitch: vswitch0, Error: Portgroup pg1 already exists
  [1]
  $ tarnhost fault add RemovePortGroup --message 'in use'
  $ orvocfg-vswitch -D pg1 vswitch0
  Failed to remove portgroup: pg1, Error: in use
  [1]

-v sets one port group, or all with ALL: a refusal on one, the others still set.

  $ orvocfg-vswitch -v 0x10 -p pg1 vswitch0
  $ tarnhost fault add SetVlanId --on pg1 --message 'vlan refused'
  $ orvocfg-vswitch -v 20 -p ALL vswitch0
  Set vlan id to 20 failed for pg1, Error: vlan refused
  [1]
  $ vlans
  Management 20
  pg1 16
  pg2 20
  $ orvocfg-vswitch -v 30 -p all vswitch0
  No such portgroup: all under vswitch: vswitch0
  [1]

ALL on a switch without port groups is silent.

  $ orvocfg-vswitch -a empty && orvocfg-vswitch -v 5 -p ALL empty

Failures reading the port group list or names are fatal.

  $ for f in GetPortGroups 'GetName --on pg1'; do
  >   tarnhost fault add $f --detail "${f%% *} failed"; orvocfg-vswitch -v 5 -p pg2 vswitch0; echo "status $?"; done
  GetPortGroups failed
  status 1
  GetName failed
  status 1
  $ vlans
  Management 20
  pg1 16
  pg2 20

Names that would forge a line (a newline, an escape sequence, a comma in a
switch name) are refused, and the trace stays one line per call.

  $ export TARN_TRACE=$PWD/trace
  $ orvocfg-vswitch -A "$(printf 'pg\nRemovePortGroup("Management") on vswitch0')" vswitch0 2>&1 | tail -1
  RemovePortGroup("Management") on vswitch0 to vswitch: vswitch0, Error: Portgroup name contains a control character
  $ orvocfg-vswitch -a "$(printf 'vs\033[2J')"; orvocfg-vswitch -a vs,1
  Failed to add vswitch: vs\x1b[2J, Error: Virtual switch name contains a control character (esc)
  Failed to add vswitch: vs,1, Error: Virtual switch name vs,1 contains a comma
  [1]
  $ grep -cv '^[A-Za-z:]*(' trace
  0
  [1]
