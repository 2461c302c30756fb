#!/usr/bin/env bash
# Installs what is missing, builds the two tools, the plug-in and the stand-in
# host libraries (not the tests), lays out the simulated host's demo world in
# build/demo-world.db, and registers a new Kiro provider through hyracli.
set -euo pipefail
cd "$(dirname "$0")/.."
scripts/install-deps.sh --demo
cmake --preset default >/dev/null
cmake --build --preset default -j "$(nproc)" --target hyracli hyrasim tarnplugin
export HYRA_SIM_DB="$PWD/build/demo-world.db"
build/bin/hyrasim init --demo
set -x
build/bin/hyracli storage internal tarn kiroprovider add \
  --vp-name vp3 --vp-url https://vp3.example.test:8443/kiro \
  --arrayid array-c --priority 2 --isactive false
