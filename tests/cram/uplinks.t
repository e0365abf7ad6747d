Uplinks of a standard switch and of its port groups (-L, -U, -M, -N).

  $ . "$TESTDIR/setup.sh" init
  $ for p in pnic4 pnic5 pnic6; do tarnhost pnic add $p; done
  $ order() { orvocfg-vswitch -l | awk -v sw="$1" '$1 == sw {print $NF}'; orvocfg-vswitch -x "$1"; }

Linking makes the pnic the last active uplink; unlinking an active uplink
lowers the count, a standby one leaves it (every case of the two edits: the
teaming unit test).

  $ orvocfg-vswitch -a sw1
  $ for p in pnic1 pnic2 pnic3 pnic4; do orvocfg-vswitch -L $p sw1; done
  $ orvocfg-vswitch -X 2 sw1 && orvocfg-vswitch -L pnic5 sw1
  $ order sw1
  pnic1,pnic2,pnic5,pnic3,pnic4
  3
  $ orvocfg-vswitch -U pnic2 sw1 && orvocfg-vswitch -U pnic3 sw1 && order sw1
  pnic1,pnic5,pnic4
  2

A pnic already in the order is linked but no policy is stored.

  $ tarnhost dump | python3 -c 'import json,sys; d=json.load(sys.stdin); [v["policy"].update(uplinkOrder=["pnic0","pnic3"]) for v in d["tables"]["vswitch"] if v["name"] == "vswitch0"]; json.dump(d,sys.stdout)' > host.json
  $ tarnhost load host.json
  $ TARN_TRACE=$PWD/trace orvocfg-vswitch -L pnic3 vswitch0
  $ grep -e AddUplink -e SetTeamingPolicy trace
  AddUplink("pnic3", true) on vswitch0
  $ order vswitch0
  pnic0,pnic3
  1

A failed link writes back the policy as first read; the pnic stays linked.

  $ tarnhost fault add SetTeamingPolicy --on vswitch0 --message 'policy store failed'
  $ TARN_TRACE=$PWD/trace2 orvocfg-vswitch -L pnic6 vswitch0
  Failed to add uplink pnic6 to vswitch vswitch0, Error: policy store failed
  [1]
  $ grep -c SetTeamingPolicy trace2
  2
  $ order vswitch0
  pnic0,pnic3
  1
  $ TARN_TRACE=$PWD/trace3 orvocfg-vswitch -U pnic6 vswitch0
  Not a valid pnic: pnic6
  $ grep -e SetTeamingPolicy -e RemoveUplink trace3
  RemoveUplink("pnic6", false) on vswitch0

Only the first policy read of a link is left to the run-wide handler.

  $ tarnhost fault add GetTeamingPolicy --on vswitch0 --detail 'first read failed'
  $ orvocfg-vswitch -L pnic1 vswitch0
  first read failed
  [1]
  $ tarnhost fault add GetTeamingPolicy --on vswitch0 --skip 1 --message 'second read failed'
  $ orvocfg-vswitch -L pnic1 vswitch0
  Failed to add uplink pnic1 to vswitch vswitch0, Error: second read failed
  [1]

A failing unlink falls back to the stored configuration, with status 0.

  $ tarnhost fault add RemoveUplink --on vswitch0 --message 'busy'
  $ TARN_TRACE=$PWD/trace4 orvocfg-vswitch -U pnic0 vswitch0
  Removing from config file only
  $ grep RemoveUplink trace4
  RemoveUplink("pnic0", false) on vswitch0
  RemoveUplink("pnic0", true) on vswitch0

Port group uplinks: a port group without an order gets one of the new uplink.

  $ pg() { orvocfg-vswitch -l | awk -v pg="$1" '$1 == pg {print $NF}'; }
  $ orvocfg-vswitch -A pgA sw1
  $ orvocfg-vswitch -M pnic5 -p pgA sw1 && orvocfg-vswitch -M pnic1 -p pgA sw1 && pg pgA
  pnic5,pnic1
  $ orvocfg-vswitch -M pnic1 -p pgA sw1 && pg pgA
  pnic5,pnic1
  $ orvocfg-vswitch -M pnic3 -p pgA sw1
  Uplink (pnic3) does not exist on the switch: sw1
  [1]
  $ orvocfg-vswitch -U pnic5 sw1 && orvocfg-vswitch -N pnic5 -p pgA sw1 && pg pgA
  pnic1
  $ orvocfg-vswitch -N pnic3 -p pgA sw1 && pg pgA
  Not a valid pnic: pnic3
  pnic1

The port group must exist on the host, then on the switch named.

  $ orvocfg-vswitch -M pnic1 -p nosuch sw1
  Unknown portgroup nosuch
  [1]
  $ orvocfg-vswitch -N pnic1 -p Management sw1
  Portgroup (Management) does not exist on switch: sw1
  [1]
  $ orvocfg-vswitch -N pnic1 -p pgA nosuch
  Virtual switch nosuch does not exist
  [1]
  $ tarnhost fault add GetUplinks --on sw1 --message 'uplinks unreadable'
  $ orvocfg-vswitch -M pnic1 -p pgA sw1
  uplinks unreadable
  [1]
