#!/usr/bin/env bash
# Whole-process figures of the simulated host and the plug-in, measured side by
# side in one run: each pair of commands (the larger world against the
# smaller, or hyracli against the sqlite3 shell) runs in alternating rounds,
# and a figure is the median over the rounds of the ratio of the two medians.
# Builds an optimised tree in build-bench/ and generates its own worlds there.
#   scripts/bench.sh [ROUNDS]      (default 5 rounds)
# Prints a Markdown table; BENCHMARKS.md records one run of it.
set -euo pipefail
cd "$(dirname "$0")/.."
scripts/install-deps.sh
rounds=${1:-5}
build=build-bench
cmake -S . -B "$build" -DCMAKE_BUILD_TYPE=RelWithDebInfo >/dev/null
cmake --build "$build" -j "$(nproc)" --target hyracli hyrasim tarnplugin bench_world host_bench \
  formatter_bench render_memory_probe >/dev/null
bin=$PWD/$build/bin
work=$PWD/$build/worlds
rm -rf "$work" && mkdir -p "$work"
tarn="$bin/hyracli storage internal tarn"

# world NAME BENCH_WORLD_OPTIONS...: a world file $work/NAME.db, fully
# checkpointed so that a copy of the one file is the whole world.
world() {
  local name=$1
  shift
  "$bin/bench_world" "$@" >"$work/$name.json"
  HYRA_SIM_DB="$work/$name.db" "$bin/hyrasim" init --scenario "$work/$name.json" >/dev/null
  sqlite3 "$work/$name.db" 'PRAGMA wal_checkpoint(TRUNCATE);' >/dev/null
}
# A fresh copy of world NAME as $work/run-NAME.db, for commands that change it.
fresh() { echo "rm -f $work/run-$1.db*; cp $work/$1.db $work/run-$1.db"; }

world load-1k --containers 1000
world load-10k --containers 10000
world load-distinct-1k --containers 1000 --distinct-arrays
world load-distinct-10k --containers 10000 --distinct-arrays
world loaded-1k --containers 1000 --mounted
world loaded-10k --containers 10000 --mounted
world check-10k --config-tarns 10000 --mounted
world check-100k --config-tarns 100000 --mounted
world meta-10k --metadata 10000
world meta-100k --metadata 100000
HYRA_SIM_DB="$work/demo.db" "$bin/hyrasim" init --demo >/dev/null
"$bin/bench_world" --containers 1000 --distinct-arrays >"$work/init-1k.json"
"$bin/bench_world" --containers 10000 --distinct-arrays >"$work/init-10k.json"

results=$work/results
mkdir -p "$results"
# pair LABEL RUNS PREPARE_A COMMAND_A PREPARE_B COMMAND_B
pair() {
  local label=$1 runs=$2
  for ((r = 1; r <= rounds; ++r)); do
    hyperfine --style none --runs "$runs" --export-json "$results/$label-a-$r.json" \
      --prepare "$3" "$4" >/dev/null
    hyperfine --style none --runs "$runs" --export-json "$results/$label-b-$r.json" \
      --prepare "$5" "$6" >/dev/null
  done
}
db() { echo "HYRA_SIM_DB=$work/$1"; }
gold=0c9e2d1a-3b4f-4a5e-8f70-112233445566

pair floor 20 true "$(db demo.db) $tarn storagecontainer checktarns -p /hyra/volumes/gold -v $gold" \
  true "sqlite3 $work/demo.db 'SELECT count(*) FROM tarn'"
pair load 1 "$(fresh load-10k)" "$(db run-load-10k.db) $tarn storagecontainer load" \
  "$(fresh load-1k)" "$(db run-load-1k.db) $tarn storagecontainer load"
pair load-distinct 1 "$(fresh load-distinct-10k)" \
  "$(db run-load-distinct-10k.db) $tarn storagecontainer load" \
  "$(fresh load-distinct-1k)" "$(db run-load-distinct-1k.db) $tarn storagecontainer load"
pair second-load 3 true "$(db loaded-10k.db) $tarn storagecontainer load" \
  true "$(db loaded-1k.db) $tarn storagecontainer load"
pair checktarns 3 true "$(db check-100k.db) $tarn storagecontainer checktarns -p /hyra/volumes/c-0" \
  true "$(db check-10k.db) $tarn storagecontainer checktarns -p /hyra/volumes/c-0"
pair metadata 3 true \
  "$(db meta-100k.db) $tarn virtualvolume metadata list -c c0000000-0000-4000-8000-000000000000 -u 00000000-1111-4222-8333-444444444444" \
  true \
  "$(db meta-10k.db) $tarn virtualvolume metadata list -c c0000000-0000-4000-8000-000000000000 -u 00000000-1111-4222-8333-444444444444"
pair init 3 "rm -f $work/init.db*" "$(db init.db) $bin/hyrasim init --scenario $work/init-10k.json" \
  "rm -f $work/init.db*" "$(db init.db) $bin/hyrasim init --scenario $work/init-1k.json"

# Peak memory of the first load of 10,000 containers against its output.
eval "$(fresh load-10k)"
HYRA_SIM_DB="$work/run-load-10k.db" /usr/bin/time -f %M -o "$results/load-10k.rss" \
  $tarn storagecontainer load >"$results/load-10k.out"
peak_kib=$(cat "$results/load-10k.rss")
output_bytes=$(wc -c <"$results/load-10k.out")

python3 - "$results" "$rounds" "$peak_kib" "$output_bytes" <<'PY'
import json, statistics, sys
results, rounds, peak_kib, output_bytes = sys.argv[1], int(sys.argv[2]), int(sys.argv[3]), int(sys.argv[4])

def read(label, side, r):
    with open(f"{results}/{label}-{side}-{r}.json") as f:
        return json.load(f)["results"][0]

def figure(label):
    wall, cpu, a_wall, b_wall = [], [], [], []
    for r in range(1, rounds + 1):
        a, b = read(label, "a", r), read(label, "b", r)
        wall.append(a["median"] / b["median"])
        cpu.append((a["user"] + a["system"]) / max(b["user"] + b["system"], 1e-9))
        a_wall.append(a["median"])
        b_wall.append(b["median"])
    return (statistics.median(wall), statistics.median(cpu),
            statistics.median(a_wall), statistics.median(b_wall))

rows = [
    ("floor", "whole hyracli run (checktarns -v) / sqlite3 shell count(*)", 1.5),
    ("load", "load, 10,000 / 1,000 unmounted, 2 shared arrays", 11),
    ("load-distinct", "load, 10,000 / 1,000 unmounted, 2 arrays each", 11),
    ("second-load", "second load (all mounted), 10,000 / 1,000", 11),
    ("checktarns", "checktarns -p, 100,000 / 10,000 config-tarns", 11),
    ("metadata", "metadata list, 100,000 / 10,000 pairs", 11),
    ("init", "hyrasim init --scenario, 10,000 / 1,000 (2 arrays each)", 11),
]
print("| Work | larger (s) | smaller (s) | wall ratio | CPU ratio | goal |")
print("|---|---|---|---|---|---|")
for label, text, goal in rows:
    wall, cpu, a, b = figure(label)
    print(f"| {text} | {a:.3f} | {b:.4f} | {wall:.2f} | {cpu:.2f} | <= {goal} |")
print()
print(f"first load of 10,000 containers: median {figure('load')[2]:.2f} s (goal < 5 s)")
print(f"peak memory of that load: {peak_kib / 1024:.1f} MiB for {output_bytes / 1e6:.1f} MB of output"
      f" ({peak_kib * 1024 / output_bytes:.1f}x)")
PY
echo
echo "== formatters on a 10,000-container load result (in-process)"
"$bin/formatter_bench" --benchmark_min_time=0.5
for formatter in simple json; do
  /usr/bin/time -f "%M" -o "$results/probe-$formatter.rss" \
    "$bin/render_memory_probe" "$formatter" 10000 >"$results/probe-$formatter.out" 2>/dev/null
  echo "render_memory_probe $formatter: peak $(($(cat "$results/probe-$formatter.rss") / 1024)) MiB" \
    "for $(stat -c %s "$results/probe-$formatter.out") bytes of output"
done
