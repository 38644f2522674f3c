#!/usr/bin/env bash
# Installs the Debian packages QUARVO builds and tests with; with --fuzz, also clang and
# libFuzzer for the fuzz target. Safe to run again.
set -euo pipefail
packages=(g++ cmake ninja-build pkg-config libsqlite3-dev sqlite3 libfmt-dev libcli11-dev
          libgtest-dev libgmock-dev libcairo2-dev libpango1.0-dev libxlsxwriter-dev
          nlohmann-json3-dev poppler-utils unzip libbenchmark-dev libjemalloc-dev)
if [ "${1:-}" = "--fuzz" ]; then
  packages+=(clang libclang-rt-14-dev)
fi
missing=()
for p in "${packages[@]}"; do
  dpkg-query -W -f='${Status}' "$p" 2>/dev/null | grep -q "install ok installed" || missing+=("$p")
done
if [ ${#missing[@]} -gt 0 ]; then
  sudo_cmd=""
  [ "$(id -u)" -ne 0 ] && sudo_cmd="sudo"
  $sudo_cmd apt-get update -qq
  DEBIAN_FRONTEND=noninteractive $sudo_cmd apt-get install -y -qq "${missing[@]}"
fi
