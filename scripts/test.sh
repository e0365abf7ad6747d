#!/usr/bin/env bash
# Sets up, builds, and runs every test.
set -euo pipefail
here=$(cd "$(dirname "$0")/.." && pwd)
cd "$here"
"$here/scripts/deps.sh"
"$here/scripts/build.sh"
ctest --test-dir build -j"$(nproc)" --output-on-failure
