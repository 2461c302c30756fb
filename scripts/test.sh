#!/usr/bin/env bash
# Installs what is missing, builds everything with warnings as errors, and runs
# every test: once in a plain build, once under AddressSanitizer,
# LeakSanitizer and UBSan, and once built for 32-bit x86 (i386), the host's
# architecture; then fuzzes the command line, the scenario reader and the
# policy file for about a minute each.
set -euo pipefail
cd "$(dirname "$0")/.."
scripts/install-deps.sh
jobs=$(nproc)
for preset in ci asan i386; do
  echo "== $preset build"
  cmake --preset "$preset" >/dev/null
  cmake --build --preset "$preset" -j "$jobs"
  echo "== $preset tests"
  ctest --preset "$preset" -j "$jobs"
done
scripts/fuzz.sh
