#!/usr/bin/env bash
# Sets up, builds, and runs orvocfg-vswitch on the default simulated host.
# Arguments go to the tool; without any it lists the host's switches.
set -euo pipefail
here=$(cd "$(dirname "$0")/.." && pwd)
"$here/scripts/deps.sh"
"$here/scripts/build.sh" >/dev/null
[ $# -gt 0 ] || set -- -l
exec "$here/build/bin/orvocfg-vswitch" "$@"
