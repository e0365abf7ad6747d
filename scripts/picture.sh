#!/usr/bin/env bash
# Draws docs/host.svg, the picture in the README: the README's example host
# (the default host, plus vSwitch1 with the port group Production on VLAN 42
# and pnic1) as `tarnhost show --dot` describes it. Needs a build
# (scripts/build.sh; BUILD_DIR names another) and Graphviz's dot.
set -euo pipefail
here=$(cd "$(dirname "$0")/.." && pwd)
bin=$here/${BUILD_DIR:-build}/bin
scratch=$(mktemp -d)
trap 'rm -rf "$scratch"' EXIT
export TARN_HOST_DB=$scratch/host.db
unset TARN_TRACE
"$bin/tarnhost" init 2> /dev/null
"$bin/orvocfg-vswitch" -a vSwitch1
"$bin/orvocfg-vswitch" -A Production vSwitch1
"$bin/orvocfg-vswitch" -L pnic1 vSwitch1
"$bin/orvocfg-vswitch" -v 42 -p Production vSwitch1
"$bin/tarnhost" show --dot | dot -Tsvg > "$here/docs/host.svg"
echo "wrote $here/docs/host.svg"
