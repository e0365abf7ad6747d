ENS: the activation node, activation, deactivation and reassociation.

  $ . "$TESTDIR/setup.sh" trace
  $ ens='NODI_[A-Za-z]*|GetIntParamList|ActivateEns|DeactivateEns|GetEnsMode|ReassociateEnsUplinks'

-y sets the node, then activates ENS with the two modifier flags.

  $ orvocfg-vswitch -y vswitch0
  created a new default host at */host.db (glob)
  $ calls "$ens"
  NODI_CheckSig(out, 21, out)
  GetIntParamList(1, 0)
  NODI_Set(673, 0, [1], 0, 0)
  NODI_ParamListDestroy([1])
  ActivateEns(false, false) on vswitch0
  $ orvocfg-vswitch -y -i vswitch0 && orvocfg-vswitch -y -F vswitch0 &&
  > orvocfg-vswitch --activate-ens --intr --fast-switch vswitch0
  $ calls ActivateEns
  ActivateEns(true, false) on vswitch0
  ActivateEns(false, true) on vswitch0
  ActivateEns(true, true) on vswitch0
  $ orvocfg-vswitch -Y vswitch0
  $ calls "$ens"
  DeactivateEns() on vswitch0

-z hands the portset's ENS mode on unchanged, not forced.

  $ orvocfg-vswitch -z vswitch0
  $ calls 'ReassociateEnsUplinks'
  ReassociateEnsUplinks(false, false, 0, 0) on vswitch0

After a command: a new switch gets ENS; -y -z uses the mode activation gave.

  $ orvocfg-vswitch -a -y vs1
  $ calls "AddVirtualSwitch|NODI_Set|ActivateEns" | sed 's/^AddVirtualSwitch(.*/AddVirtualSwitch/'
  AddVirtualSwitch
  NODI_Set(673, 0, [1], 0, 0)
  ActivateEns(false, false) on vs1
  $ orvocfg-vswitch -Y vs1 && orvocfg-vswitch -y -z vs1
  $ calls 'ActivateEns|DeactivateEns|ReassociateEnsUplinks'
  DeactivateEns() on vs1
  ActivateEns(false, false) on vs1
  ReassociateEnsUplinks(true, false, 0, 0) on vs1

-Y with -z, in either order: deactivation first, so the mode handed on is the
one it left.

  $ orvocfg-vswitch -z -Y vs1 && orvocfg-vswitch -y vs1 && orvocfg-vswitch -Y -z vs1
  $ calls 'DeactivateEns|GetEnsMode|ReassociateEnsUplinks'
  DeactivateEns() on vs1
  GetEnsMode() on vs1
  ReassociateEnsUplinks(false, false, 0, 0) on vs1
  DeactivateEns() on vs1
  GetEnsMode() on vs1
  ReassociateEnsUplinks(false, false, 0, 0) on vs1

Node failures end the run before ENS is touched, but NODI_Set's status is not
examined; for -y a missing portset fails before the node is set.

  $ tarnhost fault add NODI_CheckSig --times 2
  $ orvocfg-vswitch -Z >/dev/null; echo "status $?"
  NODI_CheckSig failed: Failure
  status 1
  $ orvocfg-vswitch -y -z vswitch0 >/dev/null; echo "status $?"
  NODI_CheckSig failed: Failure
  status 1
  $ calls "$ens" | sed 's/(.*//'
  NODI_CheckSig
  NODI_CheckSig
  $ tarnhost fault add GetIntParamList
  $ orvocfg-vswitch -y vswitch0 >/dev/null; echo "status $?"
  Error, failed to create NODI parameter list.
  status 1
  $ calls "$ens" | sed 's/(.*//'
  NODI_CheckSig
  GetIntParamList
  $ tarnhost fault add NODI_Set
  $ orvocfg-vswitch -y vswitch0
  $ calls "$ens" | sed 's/(.*) on/ on/; s/(.*//'
  NODI_CheckSig
  GetIntParamList
  NODI_Set
  NODI_ParamListDestroy
  ActivateEns on vswitch0
  $ orvocfg-vswitch -y nosuch 2>/dev/null; echo "status $?"
  status 1
  $ calls "$ens"
  [1]
