#!/usr/bin/env bash
# Builds QUARVO and runs `quarvo demo` (on an embedded SQLite database). The program is built
# in a folder of its own (build-demo/), apart from the test build.
set -euo pipefail
cd "$(dirname "$0")/.."
scripts/setup-debian.sh
cmake -S . -B build-demo -G Ninja -DCMAKE_BUILD_TYPE=RelWithDebInfo -DQUARVO_TESTS=OFF \
  -DQUARVO_BENCH=OFF >/dev/null
cmake --build build-demo --target quarvo
./build-demo/quarvo demo "$@"
