tarnhost: the administration tool of the simulated host.

  $ . "$TESTDIR/setup.sh"
  $ refused() { "$@" 2>err; echo "status $? $(cat err)"; }
  $ brief() { # status, output lines joined by |, usage lines cut after the command's words
  >   out=$(tarnhost "$@" 2>&1 < /dev/null)
  >   echo "$? $out" | sed -E 's/(tarnhost [a-z -]*[a-z]) [A-Z[].*/\1 .../' | grep . | paste -sd'|'; }

The usage, made from the command table, is what help, -h and --help print on
standard output with status 0; without a command it is bad usage.

  $ tarnhost help > help
  $ tarnhost -h | cmp - help && tarnhost --help | cmp - help
  $ tarnhost 2>&1 >/dev/null | tail -n +2 | cmp - help; tarnhost 2>&1 | head -1
  tarnhost: no command given
  $ sed -n '1p;5p;/system-switch add/,+1p;$p' help
  usage: tarnhost COMMAND [ARGUMENTS]
    init [--empty]                reset the host to the default host, or to an empty one
    system-switch add NAME [--ports N]
                                  add a system switch
  host, 2 bad usage.

Help at every level: that of the commands that begin with the words given,
also with -h or --help after them (which wins over mistakes, but not over
"--" or an option's value).

  $ tarnhost help pnic | head -6
  usage: tarnhost pnic add NAME
         tarnhost pnic del NAME
         tarnhost pnic list
  
  pnic add: add a physical NIC
    Its name is 1 to 31 bytes and unique.
  $ tarnhost fault --help | cmp - <(tarnhost help fault) && tarnhost -h timeout uplink | tail -1
    Also spelled: timeout uplink.
  $ for args in 'dvs add --help' 'init --full -h' 'timeout add -h' 'timeout lag 1 -h' \
  >     'help help' 'fault add -- -h x' 'dvs add d1 --mtu -h'; do
  >   brief $args | cut -d'|' -f1-2; done
  0 usage: tarnhost dvs add ...|dvs add: add a distributed switch
  0 usage: tarnhost init ...|init: reset the host to the default host, or to an empty one
  0 usage: tarnhost timeout add uplink ...|       tarnhost timeout add lag ...
  0 usage: tarnhost timeout add lag ...|timeout add lag: store a LAG timeout record
  0 usage: tarnhost help ...|help: print this text, or the help of COMMAND
  2 tarnhost: unexpected argument x|usage: tarnhost fault add ...
  2 tarnhost: bad number for --mtu: "-h"|usage: tarnhost dvs add ...
Help text is wrapped to 80 columns, which a line may fill exactly; usage
lines are not wrapped.

  $ for noun in $(sed -n 's/^  \([a-z][a-z-]*\) .*/\1/p' help | sort -u); do tarnhost help $noun; done |
  >   grep -v -e '^usage:' -e '^       tarnhost' | awk 'length > 79 { print length ":" $0 }' | sort | uniq -c
        1 80:  A line for each of the running state: its name, ports, used ports and uplinks.
        1 80:  orvocfg-vswitch -G loads the matching records. The timeout is 0 to 255 and the
        1 80:  orvocfg-vswitch -O loads the matching records. The timeout is 0 to 255 and the
        2 80:  separated by a tab and lists within a field by commas; an empty field is none.
        1 80:  used ports and uplinks. Fields are separated by a tab and lists within a field
  $ tarnhost --version
  tarnhost \d+\.\d+\.\d+ (re)
  $ tarnhost path | sed "s|$PWD|PWD|"
  PWD/host.db

Bad usage: the reason, naming what is missing or unknown, and the usage lines
of the command, or a hint where none is known, on standard error; status 2.

  $ while read -r args; do eval "set -- $args"; brief "$@"; done <<'EOF'
  > bogus
  > dumo
  > --verison
  > pnic
  > timeout add
  > pnic remove pnic9
  > fault ad X
  > pnic add
  > init --empty=yes
  > init --full
  > timeout lag vs0 1 -5
  > system-switch add s1 --ports=-8
  > fault del -1
  > timeout add lag vs0 0x10 5
  > system-switch add s1 --ports 2147483648
  > system-switch add s1 --ports 64 --ports 64
  > dvs add d1 --uplinks pnic1,,pnic2
  > dvs add d1 --mtu
  > fault add GetName --skip ' 1'
  > fault add GetName --delay 1s
  > fault add GetName --always --times 2
  > show --dot Management
  > show --json --dot
  > EOF
  2 tarnhost: unknown command: bogus|see 'tarnhost help'
  2 tarnhost: unknown command: dumo; did you mean dump?|see 'tarnhost help'
  2 tarnhost: unknown option --verison; did you mean --version?|see 'tarnhost help'
  2 tarnhost: missing verb after pnic (add, del, list)|usage: tarnhost pnic add ...|       tarnhost pnic del ...|       tarnhost pnic list
  2 tarnhost: missing word after timeout add (uplink, lag)|usage: tarnhost timeout add uplink ...|       tarnhost timeout add lag ...
  2 tarnhost: unknown command: pnic remove|usage: tarnhost pnic add ...|       tarnhost pnic del ...|       tarnhost pnic list
  2 tarnhost: unknown command: fault ad; did you mean fault add?|usage: tarnhost fault add ...|       tarnhost fault del ...|       tarnhost fault list ...|       tarnhost fault clear|       tarnhost fault ops
  2 tarnhost: missing NAME|usage: tarnhost pnic add ...
  2 tarnhost: option --empty takes no value|usage: tarnhost init ...
  2 tarnhost: unknown option --full for init|usage: tarnhost init ...
  2 tarnhost: bad number for TIMEOUT: "-5"|usage: tarnhost timeout add lag ...
  2 tarnhost: bad number for --ports: "-8"|usage: tarnhost system-switch add ...
  2 tarnhost: bad number for NUMBER: "-1"|usage: tarnhost fault del ...
  2 tarnhost: bad number for LAGID: "0x10"|usage: tarnhost timeout add lag ...
  2 tarnhost: number for --ports out of range: 2147483648|usage: tarnhost system-switch add ...
  2 tarnhost: option --ports given twice|usage: tarnhost system-switch add ...
  2 tarnhost: empty name in --uplinks|usage: tarnhost dvs add ...
  2 tarnhost: option --mtu needs a value|usage: tarnhost dvs add ...
  2 tarnhost: bad number for --skip: " 1"|usage: tarnhost fault add ...
  2 tarnhost: bad number for --delay: "1s"|usage: tarnhost fault add ...
  2 tarnhost: --always and --times exclude each other|usage: tarnhost fault add ...
  2 tarnhost: NAME is shown as text or with --json, not as a graph|usage: tarnhost show ...
  2 tarnhost: --json and --dot exclude each other|usage: tarnhost show ...
  $ ls
  help

The completion (asking tarnhost) offers exactly, and the man page lists
exactly, the commands and options of the table as the usage shows it, and
the operations as `fault ops` lists them.

  $ python3 "$TESTDIR/tarnhost_table.py" "$TESTDIR/../.."
  42 commands, 28 options, 71 operations compared

The default host as a dump; refusals of the host: "tarnhost: " and the
reason with its explanation, status 1, nothing changed (each refusal's
words: the admin test).

  $ tarnhost dump | tee before.json | python3 -c 'import json, sys; d = json.load(sys.stdin); print(d["format"], d["version"], *(f"{k}:{len(v)}" for k, v in d["tables"].items() if v))'
  created a new default host at */host.db (glob)
  tarnhost-dump 1 meta:2 pnic:4 vswitch:2 portgroup:2 link:2
  $ for args in 'pnic add pnic0' 'system-switch del vswitch0' 'fault del 1'; do
  >   refused tarnhost $args; done
  status 1 tarnhost: Pnic pnic0 already exists
  status 1 tarnhost: Virtual switch vswitch0 is not a system switch (orvocfg-vswitch -d removes it)
  status 1 tarnhost: Fault 1 does not exist (tarnhost fault list numbers the armed ones)
  $ tarnhost dump | cmp - before.json

Seeding shows up, and a dump brings it all back.

  $ tarnhost pnic add pnic4
  $ tarnhost client add Management vm1
  $ tarnhost system-switch add sys0 --ports=64
  $ tarnhost dvs add dvs0 --portset ps0 --uplinks pnic1,pnic2
  $ tarnhost dvport add dvs0 10 --client vmA --client vmB --connection-id 7
  $ tarnhost opaque add opq0 --used 3 --uplinks pnic3
  $ tarnhost timeout uplink vswitch0 pnic0 1 5
  $ tarnhost timeout add lag ps0 2 255
  $ tarnhost fault add SetVlanId --on pg2 --skip 1 --message boom
  $ tarnhost fault add -- -odd
  tarnhost: Unknown operation -odd (tarnhost fault ops lists them)
  [1]
  $ tarnhost show | sed -n "s|$PWD|PWD|;1,2p;/^Stored/,\$p"
  Host: PWD/host.db
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
  $ for noun in pnic client system-switch dvs dvport opaque timeout fault; do
  >   tarnhost $noun list; done | tr '\t' '|'
  pnic0|vswitch0|vswitch0
  pnic1|dvs0|dvs0
  pnic2|dvs0|dvs0
  pnic3|opq0|
  pnic4||
  Management|vm1
  sys0|64|0|
  dvs0|ps0|dvs-dvs0|128|3|pnic1,pnic2
  dvs0|10|7||vmA|vmB
  opq0|opq0|128|3|pnic3
  uplink|vswitch0|pnic0|1|5
  lag|ps0||2|255
  1|SetVlanId|pg2|1|1|"boom"|"injected fault in SetVlanId"|0|||0|armed
  $ tarnhost fault ops | grep -E '^(SetVlanId|TARN_ReturnStatusToString)\s' | tr '\t' '|'
  SetVlanId|yes|a port group
  TARN_ReturnStatusToString|no|nothing (any call)
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
  $ refused tarnhost pnic del pnic1
  status 1 tarnhost: Pnic pnic1 is linked to dvs0 in the stored configuration (a restore would link it again)
  $ tarnhost load - < seeded.json
  $ tarnhost dump | cmp - seeded.json

A file that cannot be read is refused and the host stays as it was (faulty
dumps: the admin test).

  $ for f in nosuch.json .; do refused tarnhost load $f; done; refused tarnhost load - < .
  status 1 tarnhost: cannot read nosuch.json: No such file or directory
  status 1 tarnhost: cannot read .: Is a directory
  status 1 tarnhost: cannot read standard input: Is a directory
  $ tarnhost dump | cmp - seeded.json

Removal refuses, in the library's words, what a switch, a link or a client
still needs (what a removal takes away: the admin test).

  $ orvocfg-vswitch -A pgS sys0 && tarnhost client add pgS vmS
  $ tarnhost dvport add dvs0 11 --connection-id 5 && orvocfg-vswitch -P pnic4 -V 11 dvs0
  $ while read -r args; do refused tarnhost $args; done <<'EOF'
  > system-switch del sys0
  > dvs del dvs0
  > dvport del dvs0 10
  > dvport del dvs0 11
  > pnic del pnic3
  > EOF
  status 1 tarnhost: Virtual switch sys0 has 1 ports in use
  status 1 tarnhost: DVS dvs0 has 1 ports in use
  status 1 tarnhost: DVPort 10 on dvs0 is in use (clients: 2)
  status 1 tarnhost: DVPort 11 on dvs0 holds uplink pnic4
  status 1 tarnhost: Pnic pnic3 is linked to opq0
  $ tarnhost client del pgS vmS && tarnhost system-switch del sys0 && tarnhost opaque del opq0 &&
  > tarnhost pnic del pnic3 && tarnhost fault del 1 && tarnhost timeout del lag ps0 2
  $ for noun in system-switch opaque fault; do tarnhost $noun list; done
  $ tarnhost pnic list | cut -f1 | paste -sd' '; { tarnhost client list; tarnhost timeout list; } | tr '\t' '|'
  pnic0 pnic1 pnic2 pnic4
  Management|vm1
  uplink|vswitch0|pnic0|1|5

Completion offers the host's names, read without waiting for its lock and
without making a host: a busy or missing host offers none.

  $ c() { tarnhost __complete "$@" | tail -n +2 | paste -sd' '; }
  $ tarnhost pnic add pnic5 && tarnhost pnic add pnic6
  $ c dvport del dvs0 ''; c client del Management ''; c dvs add d --uplinks pnic5,''; c fault add X --on p
  10 11
  vm1
  pnic5,pnic6
  ps0
  $ o() { bash -c 'source "$0"; COMP_WORDS=(orvocfg-vswitch "$@"); COMP_CWORD=$#; _orvocfg_vswitch
  >   echo "${COMPREPLY[*]}"' "$TESTDIR/../../completions/orvocfg-vswitch" "$@"; }
  $ o -L ''; o --pg=''; o -d v; o -a ''
  pnic0 pnic1 pnic2 pnic4 pnic5 pnic6
  --pg=ALL --pg=Management
  vswitch0
  
  $ flock host.db tarnhost __names switch; TARN_HOST_DB=$PWD/none.db o -d ''; [ -e none.db ] || echo none
  
  none

A name with a space is offered as it must be typed, however its start was
quoted, by both programs; so are file names:

  $ orvocfg-vswitch -A 'Guest Network' vswitch0; touch 'my dump.json'; tarnhost snapshot save 'my base'
  $ t() { bash -c 'source "$0"; COMP_WORDS=(tarnhost "$@"); COMP_CWORD=$#; _tarnhost
  >   printf "[%s]" "${COMPREPLY[@]}"; echo' "$TESTDIR/../../completions/tarnhost" "$@"; }
  $ t client add G; t client add 'Guest\ N'; t client add "'Gu"; t load my; t diff my; t diff x y
  [Guest\ Network]
  [Guest\ Network]
  [Guest\ Network]
  [my dump.json]
  [my dump.json][my base]
  []
  $ tarnhost snapshot del 'my base'
  $ o -p G; o --pg='"Gu'; o -D 'Guest\ '
  Guest\ Network
  --pg=Guest\ Network
  Guest\ Network

States that only the library makes (ENS, events, loaded timeouts, DVPort
uplinks; after a reboot, clients and DVPorts whose port group or switch was
replaced) survive a dump too.

  $ tarnhost init
  $ tarnhost client add Management vm1
  $ tarnhost dvs add dA --portset P --uplinks pnic1
  $ tarnhost dvport add dA 1 --client c1 --connection-id 3
  $ tarnhost timeout add uplink vswitch0 pnic0 1 5
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

A switch whose ports are all used (an uplink and clients; DVPorts) takes no
more clients or DVPorts. The lists of clients and DVPorts, of one port group or
switch only.

  $ tarnhost pnic add pnic9 && orvocfg-vswitch -a vsF:8 && orvocfg-vswitch -L pnic9 vsF &&
  > orvocfg-vswitch -A pgF vsF && tarnhost dvs add dF --ports 8
  $ for i in 1 2 3 4 5 6 7; do tarnhost client add pgF c$i; done
  $ for i in 1 2 3 4 5 6 7 8; do tarnhost dvport add dF $i; done
  $ refused tarnhost client add pgF c8; refused tarnhost dvport add dF 9
  status 1 tarnhost: Switch vsF has no free port
  status 1 tarnhost: Switch dF has no free port
  $ for what in 'client Management' 'client pgF' 'client pg' 'dvport dA' 'dvport dF' 'dvport d'; do
  >   set -- $what; echo "$1 list $2: $(tarnhost $1 list $2 | cut -f2 | paste -sd' ')"; done
  client list Management: vm1
  client list pgF: c1 c2 c3 c4 c5 c6 c7
  client list pg: 
  dvport list dA: 1
  dvport list dF: 1 2 3 4 5 6 7 8
  dvport list d: 

Load and dump show their progress when standard error is a terminal: one
line that overwrites itself, ended by a newline; nothing otherwise.

  $ python3 -c 'import json; print(json.dumps({"format": "tarnhost-dump", "version": 1,
  >   "tables": {"pnic": [{"name": f"p{i}"} for i in range(5000)]}}))' > big.json
  $ tarnhost load big.json 2>&1 && script -qec 'tarnhost load big.json && tarnhost dump > /dev/null' /dev/null < /dev/null |
  >   tr '\r' '\n' | grep .
  tarnhost: load 4096 rows
  tarnhost: dump 4096 of 5002 rows (81%)
  tarnhost: dump 5002 of 5002 rows (100%)

Faults that fail every call, slow calls down, or fail after a wait; each
counts the calls it fired on, and one used up stays listed as spent until
it is removed. A dump made before faults had those fields loads with none.

  $ tarnhost init && tarnhost fault add SetVlanId --on Management --always --message stuck
  $ tarnhost fault add SetVlanId --delay 20 --pass && tarnhost fault add AddPortGroup --delay 20
  $ for args in '-v 5 -p Management' '-v 6 -p Management' '-A pg1' '-A pg1' '-v 7 -p pg1'; do
  >   orvocfg-vswitch $args vswitch0 2>/dev/null; echo $?; done | paste -sd' '
  1 1 1 0 0
  $ tarnhost show --json pg1 | jq -c '.portGroup | map_values(.vlan)'
  {"running":7,"stored":7}
  $ tarnhost fault list | cut -f1,2,5,8- | tr '\t' '|'
  1|SetVlanId|1|0||always|2|armed
  2|SetVlanId|0|20|pass||1|spent
  3|AddPortGroup|0|20|||1|spent
  $ tarnhost show | sed -n '/^Faults/,$p'
  Faults
    SetVlanId on Management: lets 0 pass, then fails every call; message "stuck", detail "injected fault in SetVlanId"; fired 2
    SetVlanId: lets 0 pass, then slows 0 by 20 ms; message "injected fault", detail "injected fault in SetVlanId"; fired 1; spent
    AddPortGroup: lets 0 pass, then fails 0 by 20 ms; message "injected fault", detail "injected fault in AddPortGroup"; fired 1; spent
  $ tarnhost fault del 3 && tarnhost fault list | cut -f1 | paste -sd' '
  1 2
  $ tarnhost dump | jq '.tables.fault |= map(del(.delay_ms, .pass, .always, .fired))' | tarnhost load -
  $ tarnhost fault list | cut -f1,5,8- | tr '\t' '|'; tarnhost fault clear
  1|1|0|||0|armed
  2|0|0|||0|spent

The trace as JSON lines (the records of whole runs: docs/host.md): texts
that are not UTF-8 made so, tarnhost's commands only when they change the
host, and no end record for a killed run.

  $ export TARN_TRACE=$PWD/trace.json TARN_TRACE_FORMAT=json
  $ tarnhost fault add AddPortGroup --message $'bad\xff\t' && tarnhost fault list > /dev/null
  $ orvocfg-vswitch -A pg2 vswitch0; orvocfg-vswitch -A pg1 vswitch0; orvocfg-vswitch -A pg2 vswitch0
  Failed to add portgroup: pg2 to vswitch: vswitch0, Error: bad\xff\t (esc)
  Failed to add portgroup: pg1 to vswitch: vswitch0, Error: Portgroup pg1 already exists
  $ jq -c 'select(.program == "tarnhost" or .outcome == "fault") | del(.pid, .time, .host)' trace.json
  {"event":"open","program":"tarnhost","arguments":["fault","add","AddPortGroup","--message","bad\xef\xbf\xbd\\t"]} (esc)
  {"event":"call","operation":"AddPortGroup","arguments":"\\"pg2\\"","on":"vswitch0","outcome":"fault","fault":1,"message":"bad\xef\xbf\xbd\\t"} (esc)
  $ jq -s -c 'group_by(.pid) | map(map(.event) | unique)' trace.json; jq -r 'select(.event == "open") | .time' trace.json |
  >   grep -cE '^[0-9]{4}-[0-9]{2}-[0-9]{2}T[0-9:]{8}\.[0-9]{3}Z$'
  [["end","open"],["call","end","open"],["call","end","open"],["call","end","open"]]
  4
  $ tarnhost fault add GetVirtualSwitchById --delay 10000 --pass && : > trace.json
  $ orvocfg-vswitch -A pg3 vswitch0 & until grep -q GetVirtualSwitchInfo trace.json; do sleep 0.05; done
  $ kill -9 $! && wait $! 2>/dev/null; jq -c '[.event, .operation]' trace.json
  ["open",null]
  ["call","NetworkInfoImpl"]
  ["call","GetVirtualSwitchInfo"]
  $ unset TARN_TRACE TARN_TRACE_FORMAT; tarnhost fault list | cut -f2,11 | tr '\t' '|'
  AddPortGroup|1
  GetVirtualSwitchById|0
