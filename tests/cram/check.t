Existence checks (-c, -C): "1" or "0", status 0 either way.

  $ . "$TESTDIR/setup.sh" init trace
  $ tarnhost dvs add dvs0

A distributed switch answers the lookup; SwitchExists is not asked then.

  $ orvocfg-vswitch -c dvs0
  1
  $ grep -c SwitchExists trace
  0
  [1]
  $ orvocfg-vswitch -c vswitch0; orvocfg-vswitch -c vswitch9; orvocfg-vswitch -c Vswitch0
  1
  0
  0
  $ grep -c 'SwitchExists("vswitch9")' trace
  1

-C looks through every switch's port groups by exact name, ignoring operands.

  $ orvocfg-vswitch -a sw1 && orvocfg-vswitch -A Guests sw1
  $ orvocfg-vswitch -C Guests; orvocfg-vswitch -C Management vswitch9; orvocfg-vswitch -C management
  1
  1
  0

A switch and a port group that only the stored configuration holds (after a
reboot, before a restore) do not exist yet.

  $ tarnhost reboot
  $ orvocfg-vswitch -C Guests; orvocfg-vswitch -c sw1; orvocfg-vswitch -r; orvocfg-vswitch -C Guests
  0
  0
  1

Library failures are the run-wide handler's: nothing on standard output.

  $ for f in 'SwitchExists -c vswitch0' 'GetAllPortGroupNames -C Guests'; do set -- $f
  >   tarnhost fault add $1 --detail "$1 failed in detail"; orvocfg-vswitch $2 $3; echo "status $?"; done
  SwitchExists failed in detail
  status 1
  GetAllPortGroupNames failed in detail
  status 1
