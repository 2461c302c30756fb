#!/usr/bin/env bash
# Installs the Debian 12 packages the build, the tests and the benchmarks need
# (run as root): the native ones, clang's libFuzzer for the fuzz targets, and
# the i386 ones for the 32-bit build the plug-in ships for (nlohmann-json is
# header-only and architecture-independent, so one copy serves both).
#
#   install-deps.sh [--demo]
#
# --demo installs only what configuring the tree and building the tools needs.
set -euo pipefail
demo=false
[[ ${1:-} == --demo ]] && demo=true
packages=(build-essential cmake libboost-dev libsqlite3-dev nlohmann-json3-dev libgtest-dev libgmock-dev
  libbenchmark-dev)
$demo || packages+=(dpkg-dev bash-completion mandoc zsh fish
  hyperfine sqlite3 time
  python3 libxml2-utils
  clang-14 libfuzzer-14-dev
  g++-multilib libsqlite3-dev:i386 libgtest-dev:i386 libgmock-dev:i386 libboost-dev:i386)
missing=()
for p in "${packages[@]}"; do
  dpkg-query -W -f='${Status}' "$p" 2>/dev/null | grep -q "install ok installed" || missing+=("$p")
done
if ((${#missing[@]})); then
  export DEBIAN_FRONTEND=noninteractive
  # The :i386 packages need the architecture known to dpkg before the update.
  $demo || dpkg --print-foreign-architectures | grep -qx i386 || dpkg --add-architecture i386
  apt-get update -qq
  apt-get install -y -qq --no-install-recommends "${missing[@]}"
fi
$demo || "$(dirname "$0")/enable-i386.sh"
