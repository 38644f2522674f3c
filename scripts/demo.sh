#!/usr/bin/env bash
# Builds QUARVO and runs `quarvo demo` (on an embedded SQLite database).
set -euo pipefail
cd "$(dirname "$0")/.."
scripts/setup-debian.sh
cmake -S . -B build -G Ninja -DCMAKE_BUILD_TYPE=RelWithDebInfo -DQUARVO_TESTS=OFF >/dev/null
cmake --build build --target quarvo
./build/quarvo demo "$@"
