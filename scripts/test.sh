#!/usr/bin/env bash
# Builds QUARVO and runs the whole test suite; with --sanitize, in an address and
# undefined-behaviour sanitizer build (build-asan/).
set -euo pipefail
cd "$(dirname "$0")/.."
scripts/setup-debian.sh
dir=build
flags=(-DCMAKE_BUILD_TYPE=RelWithDebInfo)
if [ "${1:-}" = "--sanitize" ]; then
  dir=build-asan
  flags=(-DCMAKE_BUILD_TYPE=Debug -DQUARVO_SANITIZE=ON)
fi
cmake -S . -B "$dir" -G Ninja "${flags[@]}" >/dev/null
cmake --build "$dir"
ctest --test-dir "$dir" --output-on-failure -j 2
