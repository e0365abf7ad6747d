#!/usr/bin/env bash
# Sets up, builds, and runs every test: once on the normal build (g++), then
# once more on a build with AddressSanitizer and UndefinedBehaviorSanitizer
# made with clang, so that both compilers build the project warning-free.
set -euo pipefail
here=$(cd "$(dirname "$0")/.." && pwd)
cd "$here"
"$here/scripts/deps.sh"
jobs=$(nproc)

"$here/scripts/build.sh"
ctest --test-dir build -j"$jobs" --output-on-failure

export ASAN_OPTIONS=detect_leaks=1:abort_on_error=0
export UBSAN_OPTIONS=print_stacktrace=1:halt_on_error=1
BUILD_DIR=build-sanitize "$here/scripts/build.sh" -DORVO_SANITIZE=ON -DCMAKE_BUILD_TYPE=Debug \
  -DCMAKE_C_COMPILER=clang-16 -DCMAKE_CXX_COMPILER=clang++-16
ctest --test-dir build-sanitize -j"$jobs" --output-on-failure
