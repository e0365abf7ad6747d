Uplink and LAG timeouts: loaded, and printed as portset,uplink,lagid,timeout.

  $ . "$TESTDIR/setup.sh" trace
  $ tarnhost dvs add dvs9
  created a new default host at */host.db (glob)
  $ for t in 'uplink vswitch0 uplink1 1 1' 'uplink vswitch0 uplink2 1 0' \
  >     'uplink vswitch0 uplink1 16 65' 'uplink dvs9 uplink1 1 255' 'lag vswitch0 7 1' \
  >     'lag vswitch0 16 65' 'lag dvs9 7 255'; do tarnhost timeout $t; done
  $ : > trace

The modifiers go to the library as given; absent ones as empty text and 0.

  $ orvocfg-vswitch -O --portset=vswitch0 --lagid=0x10 --uplink=uplink1 &&
  > orvocfg-vswitch -O -s vswitch0 -j 1 && orvocfg-vswitch -o &&
  > orvocfg-vswitch -o -s vswitch0 -j abc -k uplink2
  vswitch0,uplink1,1,1
  vswitch0,uplink1,16,65
  vswitch0,uplink2,1,0
  vswitch0,uplink2,1,0
  $ calls '[A-Za-z]*TimeoutConfig'
  LoadUplinkTimeoutConfig("vswitch0", 16, "uplink1")
  LoadUplinkTimeoutConfig("vswitch0", 1, "")
  GetUplinkTimeoutConfig("", 0, "")
  GetUplinkTimeoutConfig("vswitch0", 0, "uplink2")
  $ orvocfg-vswitch -O -s dvs9 && orvocfg-vswitch -o -s dvs9
  dvs9,uplink1,1,255

LAG timeouts have an empty uplink column.

  $ orvocfg-vswitch -g
  $ orvocfg-vswitch -G -j 7 && orvocfg-vswitch -G --lagid=020 -s vswitch0 &&
  > orvocfg-vswitch -g
  dvs9,,7,255
  vswitch0,,7,1
  vswitch0,,16,65
  $ calls '[A-Za-z]*TimeoutConfig'
  LoadUplinkTimeoutConfig("dvs9", 0, "")
  GetUplinkTimeoutConfig("dvs9", 0, "")
  GetLagTimeoutConfig("", 0)
  LoadLagTimeoutConfig("", 7)
  LoadLagTimeoutConfig("vswitch0", 16)
  GetLagTimeoutConfig("", 0)

A failure prints the detailed message alone and nothing of the listing.

  $ for f in 'GetLagTimeoutConfig -g' 'LoadUplinkTimeoutConfig -O'; do set -- $f
  >   tarnhost fault add $1 --detail "$1 failed in detail"; orvocfg-vswitch $2; echo "status $?"; done
  GetLagTimeoutConfig failed in detail
  status 1
  LoadUplinkTimeoutConfig failed in detail
  status 1
