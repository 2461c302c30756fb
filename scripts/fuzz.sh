#!/usr/bin/env bash
# Builds the libFuzzer targets (preset fuzz) and runs each for a bounded time,
# FUZZ_SECONDS (default 60), from its seed corpus in fuzz/corpus/<target>.
# Fails on the first crash, leak, timeout or sanitizer report; the input that
# caused it is left in build-fuzz/findings/ (make it a regular test case).
set -euo pipefail
cd "$(dirname "$0")/.."
seconds=${FUZZ_SECONDS:-60}
targets=(arguments scenario policy_file)
cmake --preset fuzz >/dev/null
cmake --build --preset fuzz -j "$(nproc)" --target "${targets[@]/%/_fuzzer}"
findings=build-fuzz/findings
mkdir -p "$findings"
for target in "${targets[@]}"; do
  echo "== fuzzing $target for ${seconds}s"
  # New inputs go to a scratch corpus, so the seeds in the repository stay as they are.
  scratch=build-fuzz/corpus/$target
  mkdir -p "$scratch"
  build-fuzz/bin/${target}_fuzzer -max_total_time="$seconds" -timeout=10 -rss_limit_mb=2048 \
    -max_len=65536 -print_final_stats=1 -artifact_prefix="$findings/$target-" \
    "$scratch" "fuzz/corpus/$target" 2>"build-fuzz/$target.log" ||
    { tail -n 60 "build-fuzz/$target.log" >&2; echo "fuzz: $target failed; see $findings" >&2; exit 1; }
  grep -E '^(#[0-9]+.*DONE|stat::number_of_executed_units|stat::peak_rss_mb)' "build-fuzz/$target.log" || true
done
