The -l tables: fixed-width fields, padded and never cut; "$" marks line ends.

  $ . "$TESTDIR/setup.sh"
  $ vs() { orvocfg-vswitch "$@" vswitch0; }

A standard switch with two links and three clients (all ports configured).

  $ tarnhost init --empty && tarnhost pnic add pnic0 && tarnhost pnic add pnic1
  created a new default host at */host.db (glob)
  $ vs -a vswitch0:1536 && vs -L pnic0 && vs -L pnic1 && vs -A Management && vs -A Guests
  $ vs -v 100 -p Guests && vs -M pnic1 -p Management && vs -M pnic0 -p Management
  $ tarnhost client add Management vm1 && tarnhost client add Guests vm2 && tarnhost client add Guests vm3
  $ orvocfg-vswitch -l | sed 's/$/$/'
  Switch Name      Num Ports   Used Ports  Configured Ports  MTU     Uplinks   $
  vswitch0         1536        5           1536              1500    pnic0,pnic1$
  $
    PortGroup Name                            VLAN ID  Used Ports  Uplinks   $
    Management                                0        1           pnic1,pnic0$
    Guests                                    100      2                     $
  $

A failing port group: its fields so far, the error line, and the listing goes on.

  $ tarnhost fault add GetVlanId --on Management --message 'vlan unreadable'
  $ orvocfg-vswitch -l 2>&1 | sed 's/$/$/' | sed -n 4,7p
    PortGroup Name                            VLAN ID  Used Ports  Uplinks   $
    Management                                Listing failed for portgroup: Management under vswitch: vswitch0, Error: vlan unreadable$
    Guests                                    100      2                     $
  $

A port group name lost for its error line ends the block with the switch's error.

  $ tarnhost fault add GetVlanId --on Guests --message 'vlan unreadable'
  $ tarnhost fault add GetName --on Guests --skip 1 --message 'name unreadable'
  $ orvocfg-vswitch -l > out 2> err; echo $?; cat out err | sed 's/$/$/' | sed -n '5,$p'
  0
    Management                                0        1           pnic1,pnic0$
    Guests                                    Listing failed for portgroup: Listing failed for vswitch: vswitch0, Error: name unreadable$

A failing switch value ends the block; a name lost for its error line is fatal.

  $ tarnhost fault add GetMTU --on vswitch0 --message 'mtu unreadable'
  $ orvocfg-vswitch -l 2>&1 | sed 's/$/$/'
  Switch Name      Num Ports   Used Ports  Configured Ports  MTU     Uplinks   $
  vswitch0         1536        5           1536              Listing failed for vswitch: vswitch0, Error: mtu unreadable$
  $ tarnhost fault add GetMTU --on vswitch0
  $ tarnhost fault add GetName --on vswitch0 --skip 1 --detail 'name lost in detail'
  $ orvocfg-vswitch -l > out 2> err; echo $?; tail -1 out; cat err
  1
  vswitch0         1536        5           1536              Listing failed for vswitch: name lost in detail

A distributed switch: rows show the switch name, error lines the portset name.

  $ tarnhost init --empty && tarnhost pnic add pnic0
  $ tarnhost dvs add dvs0 --portset ps-dvs0 --ports 1024 --mtu 9000 --uplinks pnic0
  $ tarnhost dvport add dvs0 100 --client client-a
  $ tarnhost dvport add dvs0 101 --client vm1 --client vm2
  $ tarnhost dvport add dvs0 102
  $ orvocfg-vswitch -l | sed 's/$/$/'
  DVS Name         Num Ports   Used Ports  Configured Ports  MTU     Uplinks   $
  dvs0             1024        3           1024              9000    pnic0     $
  $
    DVPort ID                               In Use      Client      $
    100                                     1           client-a    $
    101                                     1           $
    102                                     0           $
  $
  $ tarnhost fault add IsInUse --on 101 --message 'port unreadable'
  $ orvocfg-vswitch -l 2>&1 | sed 's/$/$/' | sed -n 6,7p
    101                                     Listing failed for DVPort: 101 under DVSwitch: ps-dvs0, Error: port unreadable$
    102                                     0           $

The port parameters are read after the DVPort header; their failure ends the block.

  $ TARN_TRACE=$PWD/trace orvocfg-vswitch -l > /dev/null
  $ grep -A1 GetDVPortParams trace
  GetDVPortParams() on dvs0
  GetDVPorts() on dvs0
  $ tarnhost fault add GetDVPortParams --message 'params unreadable'
  $ orvocfg-vswitch -l 2>&1 | sed -n 4,5p
    DVPort ID                               In Use      Client      
  Listing failed for DVSwitch: ps-dvs0, Error: params unreadable

Opaque switches: one row, failures end the block.

  $ tarnhost init --empty && tarnhost pnic add pnic0 && tarnhost pnic add pnic1
  $ tarnhost opaque add opaque0 --portset ps-op0 --ports 512 --used 7 --uplinks pnic0,pnic1
  $ tarnhost opaque add opaque1 --ports 64
  $ orvocfg-vswitch -l | sed 's/$/$/'
  Switch Name      Num Ports   Used Ports  Uplinks   $
  opaque0          512         7           pnic0,pnic1$
  $
  Switch Name      Num Ports   Used Ports  Uplinks   $
  opaque1          64          0                     $
  $
  $ tarnhost fault add GetUsedPorts --on ps-op0 --message 'count unreadable'
  $ orvocfg-vswitch -l 2>&1 | sed 's/$/$/' | sed -n 2,3p
  opaque0          512         Listing failed for opaque switch: ps-op0, Error: count unreadable$
  Switch Name      Num Ports   Used Ports  Uplinks   $

Block order, -S for system switches only, long names pushing the row, status.

  $ tarnhost init --empty && tarnhost system-switch add sys0 --ports 32
  $ orvocfg-vswitch -l; echo $?
  1
  $ orvocfg-vswitch -a a-switch-of-twenty-c && orvocfg-vswitch -A a-port-group-name-of-exactly-forty-chars a-switch-of-twenty-c
  $ tarnhost dvs add dvs0 && tarnhost opaque add op0
  $ orvocfg-vswitch -l | grep -v -e '^ *$' -e ' Name  ' -e 'DVPort ID' | sed 's/$/$/'
  a-switch-of-twenty-c  128         0           128               1500              $
    a-port-group-name-of-exactly-forty-chars  0        0                     $
  dvs0             128         0           128               1500              $
  op0              128         0                     $
  $ orvocfg-vswitch -l -S | sed 's/$/$/'
  Switch Name      Num Ports   Used Ports  Configured Ports  MTU     Uplinks   $
  sys0             32          0           32                1500              $
  $
    PortGroup Name                            VLAN ID  Used Ports  Uplinks   $
  $
  $ tarnhost init --empty && orvocfg-vswitch -l -S; echo $?
  1
  $ tarnhost fault add GetVirtualSwitches --detail 'switch table unreadable'
  $ orvocfg-vswitch -l
  switch table unreadable
  [1]
