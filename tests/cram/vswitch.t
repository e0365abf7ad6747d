Creating and removing standard switches (-a, -d).

  $ . "$TESTDIR/setup.sh" init trace
  $ tarnhost dvs add dvs0

-a takes the four default policies in a fixed order, then creates the switch.

  $ orvocfg-vswitch -a sw1:64
  $ sed 1,2d trace
  NicCapabilities::GetDefaultPolicy()
  ShapingPolicy::GetDefaultPolicy()
  PortSecurityPolicy::GetDefaultPolicy()
  NicTeamingPolicy::GetDefaultPolicy()
  AddVirtualSwitch({16, 0, 0, {0, 0, 0, 0}, [], 0}, {false, false, false}, {false, 0, 0, 0}, {0, 0}, "sw1", 64)
  $ orvocfg-vswitch -c sw1
  1

A refused creation, or a failing default policy: one line, nothing created.

  $ orvocfg-vswitch -a sw1
  Failed to add vswitch: sw1, Error: Virtual switch sw1 already exists
  [1]
  $ tarnhost fault add GetDefaultPolicy --skip 2 --message 'no shaping today'
  $ orvocfg-vswitch -a sw2
  Failed to add vswitch: sw2, Error: no shaping today
  [1]
  $ orvocfg-vswitch -c sw2
  0

-d admits only a standard switch, or with --dvswitch any switch.

  $ for a in dvs0 nosuch '--dvswitch nosuch'; do orvocfg-vswitch -d $a 2>&1; echo "status $?"; done
  Not a valid virtual switch or it is a DVSwitch: dvs0
  status 1
  Not a valid virtual switch or it is a DVSwitch: nosuch
  status 1
  Not a valid virtual switch or it is a DVSwitch: nosuch
  status 1
  $ orvocfg-vswitch -c dvs0
  1
  $ orvocfg-vswitch -d --dvswitch dvs0 && orvocfg-vswitch -d --dvswitch sw1
  $ orvocfg-vswitch -c dvs0; orvocfg-vswitch -c sw1
  0
  0

Failures of the removal are the command's, of the admission check fatal.

  $ tarnhost fault add RemoveVirtualSwitch --message 'switch busy'
  $ orvocfg-vswitch -d vswitch0
  Failed to remove vswitch: vswitch0, Error: switch busy
  [1]
  $ tarnhost fault add SwitchExists --detail 'lookup of vswitch0 failed in detail'
  $ orvocfg-vswitch -d vswitch0
  lookup of vswitch0 failed in detail
  [1]
  $ orvocfg-vswitch -d vswitch0 && orvocfg-vswitch -c vswitch0
  0
