Distributed switches: creation parameters, DVPort uplinks, the DVPort test event.

  $ . "$TESTDIR/setup.sh" trace

By default the UUID comes from the name, and the switch is a version 6
cswitch; a given UUID is passed as typed.

  $ orvocfg-vswitch -a --dvswitch dvs0:64 &&
  > orvocfg-vswitch -a --dvswitch --uuid=0011223344556677-8899AABBCCDDEEFF dvs1
  created a new default host at */host.db (glob)
  $ calls AddDVSwitch
  AddDVSwitch("64 76 73 30 00 00 00 00-00 00 00 00 00 00 00 00", "dvs0", "cswitch", "dvs0", 64, 6, 0)
  AddDVSwitch("0011223344556677-8899AABBCCDDEEFF", "dvs1", "cswitch", "dvs1", 128, 6, 0)

Class and version from what was given (version in base 10, cut to 32 bits):

  $ n=0
  $ for args in --version=5 --version=6 --version=abc --version=+010x --version=4294967302 \
  >   --impl-class=other --impl-class=cswitch --impl-class=etherswitch \
  >   '--impl-class=etherswitch --version=0' '--impl-class=other --version=-3' \
  >   '--impl-class=cswitch --version=-1'; do
  >   n=$((n + 1))
  >   orvocfg-vswitch -a --dvswitch $args t$n || echo "status $?"
  >   printf '%-36s %s\n' "$args" "$(calls AddDVSwitch | cut -d, -f3,6)"
  > done
  --version=5                           "etherswitch", 5
  --version=6                           "cswitch", 6
  --version=abc                         "etherswitch", 0
  --version=+010x                       "cswitch", 10
  --version=4294967302                  "cswitch", 6
  Failed to add DVswitch: t6, Error: Unknown implementation class other
  status 1
  --impl-class=other                    "other", 5
  --impl-class=cswitch                  "cswitch", 6
  --impl-class=etherswitch              "etherswitch", 5
  --impl-class=etherswitch --version=0  "etherswitch", 0
  Failed to add DVswitch: t10, Error: Unknown implementation class other
  status 1
  --impl-class=other --version=-3       "other", -3
  Failed to add DVswitch: t11, Error: Invalid DVS version -1
  status 1
  --impl-class=cswitch --version=-1     "cswitch", -1

A class the version cannot back ends the run before anything else (here -y).

  $ for args in '--impl-class=etherswitch --version=6' --version=-1 \
  >   '--impl-class=cswitch --version=5' '--impl-class=cswitch --version=0'; do
  >   orvocfg-vswitch -a --dvswitch $args -y vswitch0 2>&1 >/dev/null; echo "status $?"
  > done | paste -d' ' - - | uniq -c
        2 Implementation class etherswitch cannot be                backed by DVS 6.6 status 1
        2 Implementation class cswitch can be backed                only from DVS 6.6 status 1
  $ calls 'AddDVSwitch|ActivateEns'
  [1]

A refused creation is reported, and the rest of the run goes on.

  $ tarnhost fault add AddDVSwitch --message 'no room' --detail 'no room for it'
  $ orvocfg-vswitch -a --dvswitch -y vswitch0 >/dev/null; echo "status $?"
  Failed to add DVswitch: vswitch0, Error: no room
  status 1
  $ calls 'AddDVSwitch|ActivateEns'
  AddDVSwitch("76 73 77 69 74 63 68 30-00 00 00 00 00 00 00 00", "vswitch0", "cswitch", "vswitch0", 128, 6, 0)
  ActivateEns(false, false) on vswitch0

DVPort uplinks: a port without a connection id gets the current time as one.

  $ tarnhost dvs add dvsA --id dvsA-id
  $ tarnhost dvport add dvsA 10
  $ tarnhost dvport add dvsA 11 --connection-id 77
  $ tarnhost dvport add dvsA 12
  $ : > trace
  $ before=$(date +%s); orvocfg-vswitch -P pnic1 -V 10 dvsA; echo $?; after=$(date +%s)
  0
  $ id=$(sed -n 's/^SetConnectionId(\([0-9]*\)) on 10$/\1/p' trace)
  $ [ "$before" -le "$id" ] && [ "$id" -le "$after" ] && echo "connection id is the time"
  connection id is the time
  $ calls 'SetConnectionId|AddDVPortUplink' | sed "s/$id/ID/"
  SetConnectionId(ID) on 10
  AddDVPortUplink("pnic1", {"dvsA-id", "10", ID}) on dvsA
  $ orvocfg-vswitch -P pnic2 -V 11 dvsA
  $ calls 'SetConnectionId|AddDVPortUplink'
  AddDVPortUplink("pnic2", {"dvsA-id", "11", 77}) on dvsA
  $ orvocfg-vswitch -Q pnic1 -V 12 dvsA
  $ calls 'SetConnectionId|RemoveDVPortUplink' | sed 's/^SetConnectionId([0-9]*)/SetConnectionId(ID)/'
  SetConnectionId(ID) on 12
  RemoveDVPortUplink("pnic1", 0) on dvsA

A connection id once set stays set, even when adding the uplink then fails.

  $ tarnhost dvport add dvsA 13
  $ tarnhost fault add AddDVPortUplink --detail 'uplink refused in detail'
  $ orvocfg-vswitch -P pnic3 -V 13 dvsA; echo "status $?"
  uplink refused in detail
  status 1
  $ calls SetConnectionId | sed 's/([0-9]*)/(ID)/'
  SetConnectionId(ID) on 13
  $ orvocfg-vswitch -P pnic3 -V 13 dvsA
  $ calls SetConnectionId
  [1]

The test event is raised on the port, silently.

  $ orvocfg-vswitch -T -V 11 dvsA
  $ calls TestDVPortNota
  TestDVPortNota() on 11

A port that the switch does not have ends the run, whatever rides along.

  $ for a in '-P pnic2' -T; do orvocfg-vswitch $a -V 99 -y dvsA 2>&1; echo "status $?"; done | paste -d' ' - - | uniq -c
        2 Invalid DVPort params 99 status 1
  $ calls 'SetConnectionId|AddDVPortUplink|TestDVPortNota|ActivateEns'
  [1]
