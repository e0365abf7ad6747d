Option parsing failures: every one ends the run before the host is touched.

  $ . "$TESTDIR/setup.sh"
  $ orvocfg-vswitch -h > usage.txt

Each run shows its exit status, its standard error, and its standard output,
or "(usage)" where that is exactly the usage text.

  $ run() { orvocfg-vswitch "$@" >out 2>err; echo "exit $?"; cat err; if cmp -s out usage.txt; then echo "(usage)"; else cat out; fi; }

Only one command per run, and it must come before every option with a bit;
the ENS options are not counted:

  $ run -a -a vs1
  exit 1
  Error, only one command can be performed at a time.
  (usage)
  $ run -l -c
  exit 1
  Error, only one command can be performed at a time.
  (usage)
  $ run -B down -b vs0
  exit 1
  Error, only one command can be performed at a time.
  (usage)
  $ run -y -a vs1
  exit 1
  Error, only one command can be performed at a time.
  (usage)
  $ run --portset=ps --get-lacp-timeout
  exit 1
  Error, only one command can be performed at a time.
  (usage)
  $ run -a -y -z -Y -f -m 1500 vs1
  exit 1
  Error, only one command can be performed at a time.
  (usage)

Each qualifying option needs its companion earlier on the line:

  $ run --dvswitch vs1
  exit 1
  Error, add or delete must be specified in order to use dvswitch
  (usage)
  $ run --uuid=xyz vs1
  exit 1
  Error, add must be specified in order to use uuid
  (usage)
  $ run --impl-class=c vs1
  exit 1
  Error, add must be specified in order to use impl-class
  (usage)
  $ run --version=6 vs1
  exit 1
  Error, add must be specified in order to use version
  (usage)
  $ run -a --uuid="00 11 22 33 44 55 66 77-88 99 aa bb cc dd ee ff" --dvswitch vs1
  exit 1
  Error, dvswitch must be specified in order to use uuid
  (usage)
  $ run -a --impl-class=c --dvswitch vs1
  exit 1
  Error, dvswitch must be specified in order to use impl-class
  (usage)
  $ run -a --vers=6 --dvswitch vs1
  exit 1
  Error, dvswitch must be specified in order to use version
  (usage)
  $ run -i -y vs1
  exit 1
  Error, activate-ens must be specified in order to use intr
  (usage)
  $ run -Y --fast-switch vs1
  exit 1
  Error, activate-ens must be specified in order to use fast-switch
  (usage)
  $ run -S -l
  exit 1
  Error, list must be specified in order to use system
  (usage)

Bad arguments end the run with one line and no usage text:

  $ run -v 4096 -p pg vs0
  exit 1
  Invalid vlan id.  Vlan must be between 0-4095: 4096
  $ run --vlan=12abc -p pg vs0
  exit 1
  Invalid vlan id.  Vlan must be between 0-4095: 12abc
  $ run -v -1 -p pg vs0
  exit 1
  Invalid vlan id.  Vlan must be between 0-4095: -1
  $ run -X 2x vs0
  exit 1
  Invalid max active:2x
  $ run -a -W -u xyz vs1
  exit 1
  Invalid UUID:xyz. Should be of format 61 62 63 64 65 66 67 68-69 6a 6b 6c 6d 6e 6f 00
  $ run -a -W --uuid=0123456789abcdef vs1
  exit 1
  Invalid UUID:0123456789abcdef. Should be of format 61 62 63 64 65 66 67 68-69 6a 6b 6c 6d 6e 6f 00
  $ run -a -W -u "00 11 22 33 44 55 66 77 -88 99 aa bb cc dd ee ff" vs1
  exit 1
  Invalid UUID:00 11 22 33 44 55 66 77 -88 99 aa bb cc dd ee ff. Should be of format 61 62 63 64 65 66 67 68-69 6a 6b 6c 6d 6e 6f 00

The parser's own diagnostics: unknown options (the usage text's
--get-uplink-timeout among them), missing arguments, ambiguous prefixes:

  $ run --get-uplink-timeout
  exit 1
  orvocfg-vswitch: unrecognized option '--get-uplink-timeout'
  (usage)
  $ run --load-uplink-timeout
  exit 1
  orvocfg-vswitch: unrecognized option '--load-uplink-timeout'
  (usage)
  $ run -q vs0
  exit 1
  orvocfg-vswitch: invalid option -- 'q'
  (usage)
  $ run -L
  exit 1
  orvocfg-vswitch: option requires an argument -- 'L'
  (usage)
  $ run -a --uuid
  exit 1
  orvocfg-vswitch: option '--uuid' requires an argument
  (usage)
  $ run --ad vs0
  exit 1
  orvocfg-vswitch: option '--ad' is ambiguous; possibilities: '--add' '--add-pg' '--add-pg-uplink' '--add-dvp-uplink'
  (usage)
  $ run --list=x
  exit 1
  orvocfg-vswitch: option '--list' doesn't allow an argument
  (usage)
