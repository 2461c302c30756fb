#!/usr/bin/env bash
# Installs the Debian 12 packages the build, the tests and the benchmarks need
# (run as root).
set -euo pipefail
packages=(build-essential cmake libboost-dev libsqlite3-dev nlohmann-json3-dev libgtest-dev libgmock-dev
  dpkg-dev bash-completion mandoc zsh fish
  libbenchmark-dev hyperfine sqlite3 time
  python3 libxml2-utils)
missing=()
for p in "${packages[@]}"; do
  dpkg-query -W -f='${Status}' "$p" 2>/dev/null | grep -q "install ok installed" || missing+=("$p")
done
if ((${#missing[@]})); then
  export DEBIAN_FRONTEND=noninteractive
  apt-get update -qq
  apt-get install -y -qq --no-install-recommends "${missing[@]}"
fi
