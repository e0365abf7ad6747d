Restore: switches (-r), and the uplinks of every standard switch (-R).

  $ . "$TESTDIR/setup.sh" trace

A configured host comes back exactly as it was after a reboot and -r, -R,
in its listing and in all that tarnhost shows of the running state; a
second -r, -R finds nothing missing.

  $ running() { tarnhost show | sed -n '/^Running/,/^Stored/p'; }
  $ orvocfg-vswitch -a vs1:64 && orvocfg-vswitch -a vs2 &&
  > orvocfg-vswitch -A pgA vs1 && orvocfg-vswitch -A pgB vs1 && orvocfg-vswitch -A pgC vs2 &&
  > orvocfg-vswitch -v 10 -p pgA vs1 && orvocfg-vswitch -v 4095 -p pgC vs2 &&
  > orvocfg-vswitch -L pnic1 vs1 && orvocfg-vswitch -L pnic2 vs1 && orvocfg-vswitch -L pnic3 vs2 &&
  > orvocfg-vswitch -M pnic2 -p pgA vs1 && orvocfg-vswitch -M pnic1 -p pgA vs1 &&
  > orvocfg-vswitch -m 9000 vs1 && orvocfg-vswitch -B both vs1 && orvocfg-vswitch -X 1 vs1 &&
  > orvocfg-vswitch -a --dvswitch dvs0:32 && orvocfg-vswitch -m 1600 dvs0 && tarnhost client add pgB vm1
  created a new default host at */host.db (glob)
  $ running > running.txt && orvocfg-vswitch -l > before && grep -E '^ *(vs[12]|dvs0|pg[ABC]) ' before
  vs1              64          3           64                9000    pnic1,pnic2
    pgA                                       10       0           pnic2,pnic1
    pgB                                       0        1                     
  vs2              128         1           128               1500    pnic3     
    pgC                                       4095     0                     
  dvs0             32          0           32                1600              
  $ tarnhost reboot
  $ orvocfg-vswitch -l; echo "status $?"
  status 1
  $ : > trace
  $ orvocfg-vswitch -r && orvocfg-vswitch -R
  $ calls 'RestoreDVSwitches|Refresh|RestoreVirtualSwitches|GetVirtualSwitches|RestoreUplinks'
  RestoreDVSwitches("/etc/tarnhost/dvs-cache.db")
  Refresh()
  RestoreVirtualSwitches()
  GetVirtualSwitches(false)
  RestoreUplinks() on vswitch0
  RestoreUplinks() on vs1
  RestoreUplinks() on vs2
  $ orvocfg-vswitch -l | diff before - && running | diff running.txt - && echo same
  same
  $ orvocfg-vswitch -r && orvocfg-vswitch -R && running | diff running.txt - && echo same
  same

A failed distributed switch restore: its message, and the rest goes on.

  $ tarnhost reboot
  $ tarnhost fault add RestoreDVSwitches --message 'cache unreadable' --detail 'cache unreadable in detail'
  $ orvocfg-vswitch -r >/dev/null; echo "status $?"
  cache unreadable
  status 0
  $ orvocfg-vswitch -c vs2 && orvocfg-vswitch -c dvs0
  1
  0

-R stops at the first switch that fails; those before it stay restored.

  $ tarnhost reboot
  $ orvocfg-vswitch -r
  $ tarnhost fault add RestoreUplinks --on vs1 --detail 'pnic1 is gone'
  $ : > trace
  $ orvocfg-vswitch -R; echo "status $?"
  pnic1 is gone
  status 1
  $ calls RestoreUplinks
  RestoreUplinks() on vswitch0
  RestoreUplinks() on vs1

A stored standard switch whose name a running distributed switch, or the
portset of one, took meanwhile is left out with its port groups.

  $ tarnhost init && orvocfg-vswitch -a vs1 && orvocfg-vswitch -a vs2 && orvocfg-vswitch -a vs3 &&
  > orvocfg-vswitch -A pg1 vs1 && orvocfg-vswitch -A pg2 vs2 && orvocfg-vswitch -A pg3 vs3
  $ tarnhost reboot && tarnhost dvs add vs1 --portset P1 && tarnhost dvs add dX --portset vs2
  $ orvocfg-vswitch -r && tarnhost show --json | jq -c '.running | [.standardSwitches[] |
  >   [.name, [.portGroups[].name]]], [.distributedSwitches[] | [.name, .portset]]'
  [["vswitch0",["Management"]],["vs3",["pg3"]]]
  [["vs1","P1"],["dX","vs2"]]

On a host without standard switches -R does nothing.

  $ tarnhost init --empty
  $ orvocfg-vswitch -R
