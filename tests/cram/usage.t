The usage text: the only help output, and the reply to usage errors.

  $ . "$TESTDIR/setup.sh"

-h writes the whole text to standard output, nothing else (status: --help below):

  $ orvocfg-vswitch -h 2>&1 | tee usage.txt
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
  

Below: exit status, "(usage)" if standard output is that text, ": " stderr.

  $ run() { orvocfg-vswitch "$@" >out 2>err; s=$?; e=$(cat err); cmp -s out usage.txt && s="$s (usage)" || cat out; echo "$s${e:+: $e}"; }
  $ run
  1 (usage)

-h ends the run when read; no command set, or -t: usage without a diagnostic.

  $ while read -r args; do eval "set -- $args"; run "$@"; done <<'EOF'
  > --help
  > -a -h -a vs1
  > -a --he -v 99999
  > -p pg -V 1 vs0
  > -t
  > -a -t vs1
  > EOF
  0 (usage)
  0 (usage)
  0 (usage)
  1 (usage)
  1 (usage)
  1 (usage)

One command per run, before any option with a bit; modifiers need it earlier:

  $ while read -r args; do eval "set -- $args"; run "$@"; done <<'EOF'
  > -a -a -h
  > -B down -b vs0
  > -y -a vs1
  > -a -y -z -Y -f -m 1500 vs1
  > --dvswitch vs1
  > --uuid=xyz vs1
  > --impl-class=c vs1
  > -d -W --impl-class=c vs1
  > --version=6 vs1
  > -a --uuid="00 11 22 33 44 55 66 77-88 99 aa bb cc dd ee ff" --dvswitch vs1
  > -a --impl-class=c --dvswitch vs1
  > -a --vers=6 --dvswitch vs1
  > -i -y vs1
  > -Y --fast-switch vs1
  > -S -l
  > EOF
  1 (usage): Error, only one command can be performed at a time.
  1 (usage): Error, only one command can be performed at a time.
  1 (usage): Error, only one command can be performed at a time.
  1 (usage): Error, only one command can be performed at a time.
  1 (usage): Error, add or delete must be specified in order to use dvswitch
  1 (usage): Error, add must be specified in order to use uuid
  1 (usage): Error, add must be specified in order to use impl-class
  1 (usage): Error, add must be specified in order to use impl-class
  1 (usage): Error, add must be specified in order to use version
  1 (usage): Error, dvswitch must be specified in order to use uuid
  1 (usage): Error, dvswitch must be specified in order to use impl-class
  1 (usage): Error, dvswitch must be specified in order to use version
  1 (usage): Error, activate-ens must be specified in order to use intr
  1 (usage): Error, activate-ens must be specified in order to use fast-switch
  1 (usage): Error, list must be specified in order to use system

Bad arguments: one line, no usage; the parser's own diagnostics come with it:

  $ while read -r args; do eval "set -- $args"; run "$@"; done <<'EOF'
  > -v 4096 -p pg vs0
  > --vlan=12abc -p pg vs0
  > -v -1 -p pg vs0
  > -v '7 ' -p pg vs0
  > -X 2x vs0
  > -a -W -u xyz vs1
  > --get-uplink-timeout
  > -q vs0
  > -L
  > -a --uuid
  > --ad vs0
  > --list=x
  > EOF
  1: Invalid vlan id.  Vlan must be between 0-4095: 4096
  1: Invalid vlan id.  Vlan must be between 0-4095: 12abc
  1: Invalid vlan id.  Vlan must be between 0-4095: -1
  1: Invalid vlan id.  Vlan must be between 0-4095: 7 
  1: Invalid max active:2x
  1: Invalid UUID:xyz. Should be of format 61 62 63 64 65 66 67 68-69 6a 6b 6c 6d 6e 6f 00
  1 (usage): orvocfg-vswitch: unrecognized option '--get-uplink-timeout'
  1 (usage): orvocfg-vswitch: invalid option -- 'q'
  1 (usage): orvocfg-vswitch: option requires an argument -- 'L'
  1 (usage): orvocfg-vswitch: option '--uuid' requires an argument
  1 (usage): orvocfg-vswitch: option '--ad' is ambiguous; possibilities: '--add' '--add-pg' '--add-pg-uplink' '--add-dvp-uplink'
  1 (usage): orvocfg-vswitch: option '--list' doesn't allow an argument
