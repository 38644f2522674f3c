#!/usr/bin/env bash
# Builds QUARVO with its tests and runs the whole suite; a run that finds no test fails.
#   scripts/test.sh             the whole suite (build/), long crash tests included; the plain
#                               build also compiles the benchmarks, so that they cannot rot
#   scripts/test.sh --sanitize  the suite under the address and undefined-behaviour sanitizers
#                               (build-asan/), without the tests labelled "long"
#   scripts/test.sh --tsan      the tests of what runs threads of its own (the store, the screen
#                               model) under the thread sanitizer (build-tsan/)
set -euo pipefail
cd "$(dirname "$0")/.."
scripts/setup-debian.sh
dir=build
flags=(-DCMAKE_BUILD_TYPE=RelWithDebInfo -DQUARVO_TESTS=ON -DQUARVO_BENCH=ON)
select=()
case "${1:-}" in
  --sanitize)
    dir=build-asan
    flags=(-DCMAKE_BUILD_TYPE=Debug -DQUARVO_SANITIZE=ON -DQUARVO_TESTS=ON -DQUARVO_BENCH=OFF)
    select=(-LE long)
    ;;
  --tsan)
    dir=build-tsan
    flags=(-DCMAKE_BUILD_TYPE=RelWithDebInfo -DQUARVO_TSAN=ON -DQUARVO_TESTS=ON -DQUARVO_BENCH=OFF)
    # Only the store and the screen model run threads of their own; elsewhere pango's
    # fontconfig thread is not instrumented and a test forks.
    select=(-R '^(Sqlite|TableTest\.|ModeleEcranTest\.)')
    ;;
  "") ;;
  *)
    echo "usage: scripts/test.sh [--sanitize|--tsan]" >&2
    exit 2
    ;;
esac
# The options are passed every time: a folder configured before with other values keeps its
# cache, and would otherwise build no test at all.
cmake -S . -B "$dir" -G Ninja "${flags[@]}" >/dev/null
cmake --build "$dir"
ctest --test-dir "$dir" --output-on-failure --no-tests=error -j 2 "${select[@]}"
