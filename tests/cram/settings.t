Active uplink count and discovery status (-X, -x, -B, -b).

  $ . "$TESTDIR/setup.sh" init

  $ orvocfg-vswitch -x vswitch0
  1
  $ orvocfg-vswitch -X 3 vswitch0 && orvocfg-vswitch -x vswitch0
  3
  $ orvocfg-vswitch -X -2 vswitch0
  Failed to set max active: vswitch0, Error: Invalid max active uplinks -2
  [1]
  $ orvocfg-vswitch -x vswitch0
  3
  $ tarnhost fault add GetTeamingPolicy --message 'policy unreadable'
  $ orvocfg-vswitch -x vswitch0
  Failed to get max active: vswitch0, Error: policy unreadable
  [1]

  $ orvocfg-vswitch -b vswitch0
  listen
  $ orvocfg-vswitch -B both vswitch0 && orvocfg-vswitch -B print vswitch0
  both
  $ orvocfg-vswitch -B sometimes vswitch0
  Failed to set CDP status on: vswitch0, Error: Unknown CDP status sometimes
  [1]
  $ tarnhost fault add GetCdpStatus --message 'status unreadable'
  $ orvocfg-vswitch -b vswitch0
  Failed to set CDP status on: vswitch0, Error: status unreadable
  [1]
  $ orvocfg-vswitch -b nosuch
  GetVirtualSwitchById: Virtual switch nosuch does not exist on this host
  [1]
