tarnhost diff, snapshots and try: what changed, object by object.

  $ . "$TESTDIR/setup.sh" init
  $ orvocfg-vswitch -a vSwitch1 && orvocfg-vswitch -L pnic1 vSwitch1
  $ orvocfg-vswitch -A Test vSwitch1 && orvocfg-vswitch -v 43 -p Test vSwitch1
  $ tarnhost snapshot save base && tarnhost dump > base.json

Equal states: status 0 and nothing printed; a change: a line per field, the
layers it changed in, lists as values, objects in creation order; status 1.

  $ tarnhost diff base && tarnhost diff base base.json
  $ orvocfg-vswitch -v 100 -p Test vSwitch1 && orvocfg-vswitch -L pnic2 vSwitch1
  $ orvocfg-vswitch -a vSwitch2 && orvocfg-vswitch -A Storage vSwitch2
  $ tarnhost fault add AddUplink && tarnhost pnic del pnic3
  $ tarnhost diff base
  - pnic pnic3
  vswitch vSwitch1 [running, stored]: uplinks pnic1 -> pnic1,pnic2
  vswitch vSwitch1 [running, stored]: teaming.uplinkOrder pnic1 -> pnic1,pnic2
  vswitch vSwitch1 [running, stored]: teaming.maxActive 1 -> 2
  + vswitch vSwitch2 [running, stored]
  portgroup Test [running, stored]: vlan 43 -> 100
  + portgroup Storage on vSwitch2 [running, stored]
  + fault 1 AddUplink
  [1]
  $ tarnhost dump | tarnhost diff base.json - --json | jq -c '.[] | select(.name == "Storage")'
  {"kind":"portgroup","name":"Storage","layer":"running","field":null,"from":null,"to":{"name":"Storage","switch":"vSwitch2","vlan":0,"clients":[],"teaming":{"flags":0,"balancing":0,"failback":0,"linkCriteria":{"checkMask":0,"minSpeed":0,"errorPercent":0,"fullDuplex":0},"uplinkOrderSet":false,"uplinkOrder":[],"maxActive":0}}}
  {"kind":"portgroup","name":"Storage","layer":"stored","field":null,"from":null,"to":{"name":"Storage","switch":"vSwitch2","vlan":0,"clients":[],"teaming":{"flags":0,"balancing":0,"failback":0,"linkCriteria":{"checkMask":0,"minSpeed":0,"errorPercent":0,"fullDuplex":0},"uplinkOrderSet":false,"uplinkOrder":[],"maxActive":0}}}

--layers: from the running state to the stored configuration, equal here
(what a reboot would lose: docs/testing.md).

  $ tarnhost diff --layers

Trouble is status 2.

  $ tarnhost diff nothing; echo "status $?"
  tarnhost: No snapshot or file named nothing (tarnhost snapshot list lists the snapshots)
  status 2
  $ tarnhost diff --layers base 2>&1; echo "status $?"
  tarnhost: --layers compares the host's own layers
  usage: tarnhost diff [A] [B] [--layers] [--json]
  status 2

Snapshots: restored whole (faults and events too), in one transaction.

  $ tarnhost snapshot save after && tarnhost snapshot list
  after
  base
  $ TARN_TRACE=$PWD/t.json TARN_TRACE_FORMAT=json tarnhost snapshot restore base
  $ tarnhost dump | cmp - base.json && jq -r .event t.json
  open
  end
  $ tarnhost diff base && tarnhost diff after base | head -1
  + pnic pnic3
  $ tarnhost snapshot restore gone; echo "status $?"
  tarnhost: No snapshot named gone (tarnhost snapshot list lists them)
  status 1

A damaged snapshot, or a file that is not one, is refused before the host is
touched.

  $ cp host.db.snapshots/after host.db.snapshots/bad
  $ printf '\377\377\377\377' | dd of=host.db.snapshots/bad bs=1 seek=4097 conv=notrunc 2>/dev/null
  $ tarnhost snapshot restore bad; echo "status $?"
  tarnhost: Host database */host.db: */host.db.snapshots/bad is damaged (Page 2: btreeInitPage() returns error code 11); the host was not changed (glob)
  status 1
  $ echo x > host.db.snapshots/bad && tarnhost snapshot restore bad 2>&1 | sed 's|^.*/bad|bad|'
  bad (file is not a database); the host was not changed
  $ tarnhost diff base && tarnhost snapshot del bad
  $ tarnhost snapshot save a/b 2>&1
  tarnhost: snapshot name a/b contains '/' (a name is 1 to 64 bytes without '/' or a control character, not starting with '.')
  usage: tarnhost snapshot save NAME
  [2]
  $ tarnhost snapshot del after && tarnhost snapshot list && ls host.db.snapshots
  base
  base

try: the command runs on a copy, whose difference is printed; the host stays,
the copy goes, the status is the command's.

  $ TMPDIR=$PWD/tmp && mkdir tmp && export TMPDIR
  $ tarnhost try --trace -- sh -c 'orvocfg-vswitch -v 7 -p Test vSwitch1; exit 3'
  portgroup Test [running, stored]: vlan 43 -> 7
  NetworkInfoImpl()
  GetVirtualSwitchInfo()
  GetVirtualSwitchById("vSwitch1", 0)
  GetPortGroups() on vSwitch1
  GetName() on Test
  SetVlanId(7) on Test
  [3]
  $ tarnhost dump | cmp - base.json && ls tmp
  $ tarnhost try --json -- orvocfg-vswitch -D Test vSwitch1 | jq -c '.[] | [.kind, .name, .layer]'
  ["portgroup","Test","running"]
  ["portgroup","Test","stored"]
  $ tarnhost try ls 2>&1; tarnhost try -- 2>&1
  tarnhost: unexpected argument ls before --
  usage: tarnhost try [--json] [--trace] -- COMMAND [ARGS...]
  tarnhost: missing COMMAND
  usage: tarnhost try [--json] [--trace] -- COMMAND [ARGS...]
  [2]
