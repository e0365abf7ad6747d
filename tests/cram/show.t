tarnhost show: the host as JSON for programs, and as a graph that dot draws,
checked node for node and edge for edge against the JSON.

  $ . "$TESTDIR/setup.sh"
  $ drawn() { tarnhost show --json > host.json && tarnhost show --dot > host.dot &&
  >   dot -Tjson host.dot > graph.json && python3 "$TESTDIR/graph_check.py" host.json graph.json; }
  $ drawn
  created a new default host at */host.db (glob)
  6 nodes, 2 edges compared

A larger host: three switches with 20 port groups, one with an order of its
own, a distributed switch with DVPorts, an opaque switch; after a reboot,
its switches restored without their links, and a dump edited so that the layers differ.

  $ tarnhost pnic add pnic4 && tarnhost pnic add pnic5
  $ for s in 1 2 3; do orvocfg-vswitch -a vs$s; done
  $ orvocfg-vswitch -L pnic1 vs1 && orvocfg-vswitch -L pnic2 vs1 && orvocfg-vswitch -X 1 vs1 &&
  > orvocfg-vswitch -L pnic4 vs2
  $ for i in $(seq 20); do
  >   orvocfg-vswitch -A pg$i vs$((i % 3 + 1)) && orvocfg-vswitch -v $i -p pg$i vs$((i % 3 + 1)); done
  $ orvocfg-vswitch -M pnic2 -p pg3 vs1 && tarnhost client add pg1 vm1 && tarnhost client add pg3 vm3
  $ tarnhost dvs add dvs0 --uplinks pnic5 && tarnhost dvport add dvs0 100 --client vmA --connection-id 7 &&
  > tarnhost dvport add dvs0 101 && tarnhost opaque add overlay0 --used 3 --uplinks pnic3
  $ tarnhost reboot && orvocfg-vswitch -r
  $ tarnhost dump | jq '.tables.portgroup |= map(select(.layer == 1 or .name != "pg20")
  >   | if .layer == 0 and .name == "pg19" then .vlan = 99 else . end)' | tarnhost load -
  $ drawn
  38 nodes, 33 edges compared
  $ grep -E 'pnic:pnic[1245]"|VLAN (19|20)' host.dot
    {rank=sink; "pnic:pnic0"; "pnic:pnic1"; "pnic:pnic2"; "pnic:pnic3"; "pnic:pnic4"; "pnic:pnic5";}
    "pnic:pnic1" [label="pnic1", shape=box];
    "pnic:pnic2" [label="pnic2", shape=box];
    "pnic:pnic4" [label="pnic4", shape=box];
    "pnic:pnic5" [label="pnic5", shape=box];
    "portgroup:pg3" -> "pnic:pnic2" [label="#1 active", color=blue, fontcolor=blue, penwidth=2];
    "portgroup:pg19" [label="pg19\nVLAN 19 (stored: VLAN 99)", shape=ellipse];
    "portgroup:pg20" [label="pg20\nVLAN 20", shape=ellipse, style="dotted"];
    "dvswitch:dvs0" -> "pnic:pnic5";
    "vswitch:vs1" -> "pnic:pnic1" [label="#1 active", penwidth=2, style="dashed"];
    "vswitch:vs1" -> "pnic:pnic2" [label="#2 standby", style="dashed"];
    "vswitch:vs2" -> "pnic:pnic4" [label="#1 active", penwidth=2, style="dashed"];

JSON: the layers by name, words for codes, texts that are not UTF-8 in hex.

  $ jq -c '.running, .stored | keys_unsorted' host.json
  ["standardSwitches","distributedSwitches","ens","uplinkTimeouts","lagTimeouts"]
  ["standardSwitches","distributedSwitches","uplinkTimeouts","lagTimeouts"]
  $ tarnhost show --json dvs0 | jq -c '.distributedSwitch | .running, .stored.uplinks, .dvports'
  {"name":"dvs0","portset":"dvs0","switchId":"dvs-dvs0","uuid":"64 76 73 30 00 00 00 00-00 00 00 00 00 00 00 00","implClass":"cswitch","version":0,"ports":128,"mtu":1500,"uplinks":[{"pnic":"pnic5","dvport":null}]}
  [{"pnic":"pnic5","dvport":null}]
  [{"dvs":"dvs0","portId":"100","connectionId":7,"clients":["vmA"]},{"dvs":"dvs0","portId":"101","connectionId":0,"clients":[]}]
  $ tarnhost show --json pg3 | jq -c '.portGroup.running | .teaming | {uplinkOrderSet, uplinkOrder, maxActive}'
  {"uplinkOrderSet":true,"uplinkOrder":["pnic2"],"maxActive":1}

One object by its name, as JSON or text: a DVPort as DVS:PORTID; completion
offers exactly the names show takes.

  $ tarnhost show --json dvs0:100 | jq -c 'keys_unsorted, .dvport.clients'
  ["name","dvport"]
  ["vmA"]
  $ tarnhost show overlay0; tarnhost show dvs0:100; tarnhost show pg3 | head -3
  Opaque switch
    overlay0: portset overlay0, 128 ports, 3 used, uplinks pnic3
  DVPort
    dvs0 port 100: connection id 7, clients vmA
  Running state
    On standard switch vs1:
      Port group pg3: VLAN 3, clients vm3
  $ tarnhost __complete show d | tail -n +2
  dvs0
  dvs0:100
  dvs0:101
  $ tarnhost fault add GetName --message $'bad\xff' && tarnhost show --json | jq -c '.faults'
  [{"number":1,"operation":"GetName","on":null,"message":{"hex":"626164ff"},"detail":"injected fault in GetName","skip":0,"times":1,"delayMs":0,"pass":false,"always":false,"fired":0,"state":"armed"}]

A teaming order is a list, whatever its names hold:

  $ tarnhost pnic add 'p:' && orvocfg-vswitch -a vsP && orvocfg-vswitch -L 'p:' vsP
  $ tarnhost show vsP | grep -m1 Teaming
      Teaming: flags 0x10, balancing 0, failback 0, order p:, max active 1
