The usage text: the only help output, and the reply to usage errors.

  $ . "$TESTDIR/setup.sh"

-h writes the whole text to standard output, nothing else, and exits with 0:

  $ orvocfg-vswitch -h 2>err
  orvocfg-vswitch [options] [vswitch[:ports]]
    -a|--add                    Add a new virtual switch.
             [--dvswitch --uuid=<16 hexadecimal digits> 
              --impl-class=<implementation class>
              --version=<dvswitch version>] 
                                Use --dvswitch to add a DVSwitch instead.
                                (FOR INTERNAL USE ONLY).
                                Use --uuid to specify the UUID for the DVSwitch
                                (FOR INTERNAL USE ONLY).
                                Use --impl-class to change implementation class 
                                from the default "etherswitch" class
                                (FOR INTERNAL USE ONLY).
                                Use --version to change dvswitch version
                                (FOR INTERNAL USE ONLY).
    -d|--delete                 Delete the virtual switch.
             [--dvswitch ]      Use --dvswitch to delete a DVSwitch instead.
                                (FOR INTERNAL USE ONLY).
  
    -l|--list                   List all the virtual switches.
             [-S|--system]      List system VSS.
    -L|--link=pnic              Set pnic as an uplink for the vswitch.
    -U|--unlink=pnic            Remove pnic from the uplinks for the vswitch.
    -R|--restore-uplinks        Restore uplinks for all vswitches from config file.
                                (FOR INTERNAL USE ONLY).
    -M|--add-pg-uplink=uplink   Add an uplink to the list of uplinks for a portgroup 
    -N|--del-pg-uplink=uplink   Delete an uplink from the list of uplinks for a portgroup 
    -P|--add-dvp-uplink=uplink  Add an uplink to a DVPort on a DVSwitch.
                                Must specify DVPort Id.
    -Q|--del-dvp-uplink=uplink  Delete an uplink from a  DVPort on a DVSwitch.
                                Must specify DVPort Id.
    -V|--dvp=dvport             Specify a DVPort Id for the operation. 
    -p|--pg=portgroup           Specify a portgroup for operation
                                Use ALL to set VLAN IDs on all portgroups
    -v|--vlan=id                Set vlan id for portgroup specified by -p
                                0 would disable the vlan
    -c|--check                  Check to see if a virtual switch exists. 
                                Program outputs a 1 if it exists, 0 otherwise.
    -A|--add-pg=name            Add a new portgroup to the virtual switch.
    -D|--del-pg=name            Delete the portgroup from the virtual switch.
    -C|--check-pg=name          Check to see if a portgroup exists.  Program 
                                outputs a 1 if it exists, 0 otherwise.
    -B|--set-cdp                Set the CDP status for a given virtual switch. 
                                To set pass one of "down", "listen", "advertise", "both". 
    -b|--get-cdp                Print the current CDP setting for this switch. 
    -X|--set-maxactive          Set the max active uplinks for this switch. 
    -x|--get-maxactive          Print the max active uplinks for this switch. 
    -m|--mtu=MTU                Set MTU for the vswitch/DVSwitch. This affects all the nics attached on the vswitch.
                                (Setting the MTU of DVSwitch is FOR INTERNAL USE ONLY)
    -r|--restore                Restore all virtual switches from the configuration file
                                (FOR INTERNAL USE ONLY).
    -y|--activate-ens           Activate ENS on the virtual switch.
             [-i|--intr]
             [-F|--fast-switch]
                                Use --intr to enable interrupt for ENS.
    -Y|--deactivate-ens         Deactivate ENS on the virtual switch.
    -z|--reassociate-ens        Reassociate uplinks
                                (FOR INTERNAL USE ONLY).
    -o|--get-uplink-timeout       Get uplinks timeout configuration.
             [--portset --lagid --uplink]
                                Use --portset to get a portset uplinks timeout configuration.
                                Use --lagid to get uplinks timeout configuration.
                                Use --uplink to get specified uplink timeout configuration.
    -O|--load-uplink-timeout      Load uplinks timeout configuration.
             [--portset --lagid --uplink]
                                Use --portset to load portset uplinks timeout configuration.
                                Use --lagid to load uplinks timeout configuration.
                                Use --uplink to load specified uplink timeout configuration.
    -g|--get-lag-timeout        Get lag group timeout configuration.
             [--portset --lagid]
                                Use --portset to get a portset lag timeout configuration.
                                Use --lagid to get lag timeout configuration.
    -G|--load-lag-timeout       Load lag group timeout configuration.
             [--portset --lagid]
                                Use --portset to load portset lag timeout configuration.
                                Use --lagid to load lag timeout configuration.
    -h|--help                   Show this message.
  
  Note:
  
    orvocfg-vswitch does not support creation, modification or deletion of opaque switch.
    However, they will be listed during -l|--list option.
  
  $ test -s err || echo "no stderr"
  no stderr
  $ orvocfg-vswitch -h > usage.txt; wc -l < usage.txt; tail -c 2 usage.txt | od -An -c; md5sum < usage.txt
  82
    \n  \n
  e14ffbb6bd9777ee289f51192b28421e  -

From here on each run shows its exit status, its standard error, and its
standard output, or "(usage)" where that is exactly the text above.

  $ run() { orvocfg-vswitch "$@" >out 2>err; echo "exit $?"; cat err; if cmp -s out usage.txt; then echo "(usage)"; else cat out; fi; }

-h ends the run as soon as it is read; options after it are not looked at,
those before it are:

  $ run --help
  exit 0
  (usage)
  $ run -a -h
  exit 0
  (usage)
  $ run -a -h -a vs1
  exit 0
  (usage)
  $ run -a --he -v 99999
  exit 0
  (usage)
  $ run -a -a -h
  exit 1
  Error, only one command can be performed at a time.
  (usage)

The empty command line, and options that set no command, are usage errors:

  $ run
  exit 1
  (usage)
  $ run -p pg -V 1 vs0
  exit 1
  (usage)

-t is accepted by the parser but stands for nothing: usage, no diagnostic.

  $ run -t
  exit 1
  (usage)
  $ run -a -t vs1
  exit 1
  (usage)
