#!/usr/bin/env bash
# Installs the Debian packages the project builds and tests with, when missing
# (clang 16 and its sanitizer runtimes make the sanitizer build; clang 14,
# Debian's default clang, has no std::source_location).
# --bench: also the measuring tools of bench/run.py.
set -euo pipefail
packages=(cmake g++ make pkg-config libsqlite3-dev sqlite3 nlohmann-json3-dev libsimdjson-dev
          libgtest-dev libgmock-dev python3-cram man-db groff-base dpkg-dev
          graphviz jq lintian strace clang-16 libclang-rt-16-dev)
[ "${1:-}" != --bench ] || packages+=(valgrind time)
missing=()
for p in "${packages[@]}"; do
  dpkg-query -W -f='${Status}' "$p" 2>/dev/null | grep -q 'install ok installed' || missing+=("$p")
done
if ((${#missing[@]})); then
  sudo=""
  [ "$(id -u)" -eq 0 ] || sudo="sudo"
  $sudo apt-get update -qq
  DEBIAN_FRONTEND=noninteractive $sudo apt-get install -y -qq "${missing[@]}" >/dev/null
fi
