tarnhost: the administration tool of the simulated host.

  $ . "$TESTDIR/setup.sh"
  $ usage() { "$@" 2>err; echo "status $?"; head -1 err; tail -n +2 err | cmp - help; }
  $ refused() { "$@" 2>err; echo "status $?"; cat err; }

Help goes to standard output with status 0; it is the text bad usage shows.

  $ tarnhost --help > help
  $ tarnhost -h | cmp - help
  $ cat help
  usage: tarnhost COMMAND [ARGUMENTS]
  Administers the simulated host kept in $TARN_HOST_DB (see docs/host.md).
  
    init [--empty]        reset: the default host, or a host with nothing at all
    show                  the host in readable form: running state and stored configuration
    dump                  the whole host as JSON on standard output
    load FILE             replace the host with a dump (FILE - : standard input)
    reboot                drop the running state, keep the stored configuration
    pnic add NAME
    client add PORTGROUP CLIENT
    system-switch add NAME [--ports N]
    dvs add NAME [--portset NAME] [--id ID] [--ports N] [--mtu N] [--uplinks A,B,...]
    dvport add DVS PORTID [--client NAME]... [--connection-id N]
    opaque add NAME [--portset NAME] [--ports N] [--used N] [--uplinks A,B,...]
    timeout uplink PORTSET UPLINK LAGID TIMEOUT
    timeout lag PORTSET LAGID TIMEOUT
    fault add OPERATION [--on NAME] [--message TEXT] [--detail TEXT] [--skip K] [--times N]
    fault clear
    -h, --help            this text
  
  Numbers are decimal. Options take their value as --opt VALUE or --opt=VALUE;
  "--" ends the options. Exit status: 0 success, 1 refused by the host, 2 bad usage.

Bad usage: the reason and the usage text on standard error, no host opened.

  $ usage tarnhost
  status 2
  tarnhost: no command given
  $ while read -r args; do eval "set -- $args"; usage tarnhost "$@" < /dev/null; done <<'EOF' | paste -d' ' - -
  > bogus
  > pnic
  > pnic remove pnic9
  > pnic add
  > pnic add a b
  > init --empty=yes
  > init --full
  > timeout lag vs0 1 -5
  > timeout lag vs0 0x10 5
  > timeout lag vs0 4294967296 5
  > system-switch add s1 --ports 2147483648
  > system-switch add s1 --ports 64 --ports 64
  > dvs add d1 --uplinks pnic1,,pnic2
  > dvs add d1 --mtu
  > fault add GetName --skip ' 1'
  > EOF
  status 2 tarnhost: unknown command: bogus
  status 2 tarnhost: missing subcommand after pnic
  status 2 tarnhost: unknown command: pnic remove
  status 2 tarnhost: missing arguments
  status 2 tarnhost: too many arguments
  status 2 tarnhost: option --empty takes no value
  status 2 tarnhost: unknown option --full
  status 2 tarnhost: bad number for TIMEOUT: "-5"
  status 2 tarnhost: bad number for LAGID: "0x10"
  status 2 tarnhost: number for LAGID out of range: 4294967296
  status 2 tarnhost: number for --ports out of range: 2147483648
  status 2 tarnhost: option --ports given twice
  status 2 tarnhost: empty name in --uplinks
  status 2 tarnhost: option --mtu needs a value
  status 2 tarnhost: bad number for --skip: " 1"
  $ ls
  err
  help

The default host as a dump.

  $ tarnhost dump | python3 -c 'import json, sys; d = json.load(sys.stdin); print(d["format"], d["version"], *(f"{k}:{len(v)}" for k, v in d["tables"].items() if v))'
  created a new default host at */host.db (glob)
  tarnhost-dump 1 meta:2 pnic:4 vswitch:2 portgroup:2 link:2

Refusals of the host: "tarnhost: " and the reason, status 1, nothing changed.

  $ tarnhost dump > before.json
  $ while read -r args; do eval "set -- $args"; refused tarnhost "$@" < /dev/null; done <<'EOF' | paste -d' ' - -
  > pnic add pnic0
  > client add nosuch vm1
  > system-switch add vswitch0
  > system-switch add s1 --ports 4097
  > dvs add d1 --uplinks pnic0
  > dvs add d1 --uplinks pnic9
  > dvs add d1 --mtu 1279
  > dvs add 0123456789012345678901234567890123
  > dvport add nosuch 10
  > opaque add o1 --ports 16 --used 17
  > timeout uplink vs0 u1 1 256
  > fault add GetName --times 0
  > fault add ''
  > EOF
  status 1 tarnhost: Pnic pnic0 already exists
  status 1 tarnhost: Portgroup nosuch does not exist
  status 1 tarnhost: Virtual switch vswitch0 already exists
  status 1 tarnhost: Invalid number of ports 4097
  status 1 tarnhost: pnic0 is already linked to vswitch0
  status 1 tarnhost: Uplink pnic9 does not exist
  status 1 tarnhost: MTU 1279 is out of range
  status 1 tarnhost: Virtual switch name 0123456789012345678901234567890123 is too long
  status 1 tarnhost: DVS nosuch does not exist
  status 1 tarnhost: Invalid number of used ports 17
  status 1 tarnhost: Invalid timeout 256
  status 1 tarnhost: Invalid times 0
  status 1 tarnhost: Fault operation is empty
  $ tarnhost dump | cmp - before.json

Seeding shows up, and a dump brings it all back.

  $ tarnhost pnic add pnic4
  $ tarnhost client add Management vm1
  $ tarnhost system-switch add sys0 --ports=64
  $ tarnhost dvs add dvs0 --portset ps0 --uplinks pnic1,pnic2
  $ tarnhost dvport add dvs0 10 --client vmA --client vmB --connection-id 7
  $ tarnhost opaque add opq0 --used 3 --uplinks pnic3
  $ tarnhost timeout uplink vswitch0 pnic0 1 5
  $ tarnhost timeout lag ps0 2 255
  $ tarnhost fault add SetVlanId --on pg2 --skip 1 --message boom
  $ tarnhost fault add -- -odd
  tarnhost: Unknown operation -odd
  [1]
  $ tarnhost show | sed -n '1p;/^Stored/,$p'
  Physical NICs: pnic0, pnic1, pnic2, pnic3, pnic4
  Stored configuration
    Standard switch vswitch0: 128 ports, MTU 1500, CDP listen
      Uplinks: pnic0
      Teaming: flags 0x10, balancing 0, failback 0, order pnic0, max active 1
      Port group Management: VLAN 0, clients vm1
        Teaming: flags 0x0, balancing 0, failback 0, order (not set), max active 0
    Standard switch sys0 (system): 64 ports, MTU 1500, CDP listen
      Uplinks: (none)
      Teaming: flags 0x10, balancing 0, failback 0, order (none), max active 0
    Uplink timeouts: vswitch0 pnic0 LAG 1: 5
    LAG timeouts: ps0 LAG 2: 255
  
  Distributed switch cache
    Distributed switch dvs0: portset ps0, id dvs-dvs0, 128 ports, MTU 1500
      UUID 64 76 73 30 00 00 00 00-00 00 00 00 00 00 00 00, class cswitch, version 0
      Uplinks: pnic1, pnic2
  
  Opaque switches
    opq0: portset opq0, 128 ports, 3 used, uplinks pnic3
  
  DVPorts
    dvs0 port 10: connection id 7, clients vmA, vmB
  
  Events
    (none)
  
  Faults
    SetVlanId on pg2: lets 1 pass, then fails 1; message "boom", detail "injected fault in SetVlanId"
  $ tarnhost dump > seeded.json
  $ tarnhost fault clear
  $ tarnhost reboot
  $ tarnhost show | sed -n '/^Running/,/^Stored/p'
  Running state
    Standard switches: (none)
    Distributed switches: (none)
    ENS: activation node not set; active on (none)
    Uplink timeouts: (none)
    LAG timeouts: (none)
  
  Stored configuration
  $ tarnhost load - < seeded.json
  $ tarnhost dump | cmp - seeded.json

A faulty dump or file is refused and the host stays as it was.

  $ sed 's/"version": 1/"version": 9/' seeded.json > v9.json
  $ refused tarnhost load v9.json
  status 1
  tarnhost: Cannot load dump: unsupported version 9 (this host reads version 1)
  $ head -c 300 seeded.json > cut.json
  $ refused tarnhost load cut.json
  status 1
  tarnhost: Cannot load dump: not valid JSON: parse error at line 21, column 8: syntax error while parsing object key - unexpected end of input; expected string literal
  $ refused tarnhost load nosuch.json
  status 1
  tarnhost: cannot read nosuch.json: No such file or directory
  $ tarnhost dump | cmp - seeded.json

States that only the library makes (ENS, events, loaded timeouts, DVPort
uplinks; after a reboot, clients and DVPorts whose port group or switch was
replaced) survive a dump too.

  $ tarnhost init
  $ tarnhost client add Management vm1
  $ tarnhost dvs add dA --portset P --uplinks pnic1
  $ tarnhost dvport add dA 1 --client c1 --connection-id 3
  $ tarnhost timeout uplink vswitch0 pnic0 1 5
  $ orvocfg-vswitch -a vs1 && orvocfg-vswitch -L pnic2 vs1 && orvocfg-vswitch -A pg1 vs1 &&
  > orvocfg-vswitch -v 10 -p pg1 vs1 && orvocfg-vswitch --ens-ready && orvocfg-vswitch -y -i vs1 &&
  > orvocfg-vswitch -z vs1 && orvocfg-vswitch -O && orvocfg-vswitch -P pnic3 -V 1 dA
  $ tarnhost dump > running.json && tarnhost load running.json && tarnhost dump | cmp - running.json
  $ tarnhost reboot
  $ orvocfg-vswitch -a --dvswitch P && orvocfg-vswitch -a vswitch0
  $ tarnhost dump > rebooted.json && tarnhost load rebooted.json && tarnhost dump | cmp - rebooted.json
  $ tarnhost show | sed -n '/^DVPorts/,$p'
  DVPorts
    dA port 1: connection id 3, clients c1
  
  Events
    ENS reassociation on vs1: mode 1, force 0
  
  Faults
    (none)
