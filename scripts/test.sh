#!/usr/bin/env bash
# Builds QUARVO with its tests and runs the whole suite; with --sanitize, in an address and
# undefined-behaviour sanitizer build (build-asan/). The plain build also compiles the
# benchmarks, so that they cannot rot unseen. A run that finds no test fails.
set -euo pipefail
cd "$(dirname "$0")/.."
scripts/setup-debian.sh
dir=build
flags=(-DCMAKE_BUILD_TYPE=RelWithDebInfo -DQUARVO_TESTS=ON -DQUARVO_BENCH=ON)
if [ "${1:-}" = "--sanitize" ]; then
  dir=build-asan
  flags=(-DCMAKE_BUILD_TYPE=Debug -DQUARVO_SANITIZE=ON -DQUARVO_TESTS=ON -DQUARVO_BENCH=OFF)
fi
# The options are passed every time: a folder configured before with other values keeps its
# cache, and would otherwise build no test at all.
cmake -S . -B "$dir" -G Ninja "${flags[@]}" >/dev/null
cmake --build "$dir"
ctest --test-dir "$dir" --output-on-failure --no-tests=error -j 2
