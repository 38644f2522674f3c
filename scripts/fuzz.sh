#!/usr/bin/env bash
# Builds the fuzz target of the text-file loader with clang and libFuzzer (build-fuzz/) and runs
# it for SECONDS seconds (default 60). Exits non-zero when the fuzzer finds a fault; the input
# that caused it is left in build-fuzz/.
set -euo pipefail
cd "$(dirname "$0")/.."
seconds="${1:-60}"
scripts/setup-debian.sh --fuzz
cmake -S . -B build-fuzz -G Ninja -DCMAKE_BUILD_TYPE=RelWithDebInfo -DCMAKE_CXX_COMPILER=clang++ \
  -DQUARVO_FUZZ=ON -DQUARVO_TESTS=OFF -DQUARVO_BENCH=OFF >/dev/null
cmake --build build-fuzz --target loader_fuzz
corpus=build-fuzz/corpus
mkdir -p "$corpus"
cp -n db/demo/*.txt "$corpus"/ 2>/dev/null || true
cd build-fuzz
./tests/fuzz/loader_fuzz -max_total_time="$seconds" -print_final_stats=1 corpus
