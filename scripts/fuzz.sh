#!/usr/bin/env bash
# Builds the fuzz preset and runs every fuzz target for a bounded time.
#   scripts/fuzz.sh                      about 60 s per target (what CI runs)
#   scripts/fuzz.sh 3600                 an hour per target
#   scripts/fuzz.sh 600 module_run       only the targets named
# Each target starts from its seed corpus (fuzz/corpus/<target>) and keeps what
# it learns in build/fuzz/corpus/<target>. A finding is written to
# build/fuzz/findings/ and the script fails; once fixed, copy the input to
# fuzz/regressions/<target>/ so that the replay tests keep it fixed.
#
# FRINGE_FUZZ_CI=1 (what CI sets) makes the run repeatable: seed 1, a fresh
# learned corpus and a fixed number of inputs per target (the time bound still
# caps a slow machine), so that a finding fails the change that made it rather
# than a later, unrelated one. FRINGE_FUZZ_SEED picks another seed.
set -euo pipefail
cd "$(dirname "$0")/.."
seconds="${1:-60}"
shift || true
targets=("$@")
if [ "${#targets[@]}" -eq 0 ]; then targets=(module_run key_strings page_loading); fi
jobs="${FRINGE_JOBS:-2}"

cmake --preset fuzz >/dev/null
cmake --build --preset fuzz -j "$jobs" --target module_run_fuzzer key_strings_fuzzer page_loading_fuzzer

findings=build/fuzz/findings
mkdir -p "$findings"
export FRINGE_ALERT_LOG=/dev/null
export ASAN_OPTIONS="detect_leaks=1:abort_on_error=1"
export UBSAN_OPTIONS="print_stacktrace=1:halt_on_error=1"
ci="${FRINGE_FUZZ_CI:-0}"
seed="${FRINGE_FUZZ_SEED:-$([ "$ci" = 1 ] && echo 1 || echo 0)}"  # 0: a new seed each run
# Inputs per target in a CI run: about a minute each on two cores.
declare -A ciRuns=([module_run]=20000 [key_strings]=1500000 [page_loading]=40000)
status=0
for target in "${targets[@]}"; do
  corpus="build/fuzz/corpus/$target"
  limits=(-max_total_time="$seconds")
  if [ "$ci" = 1 ]; then
    corpus="build/fuzz/ci-corpus/$target"
    rm -rf "$corpus"
    limits+=(-runs="${ciRuns[$target]}")
  fi
  mkdir -p "$corpus"
  echo "== $target: at most ${seconds} s, seed $seed"
  if ! "build/fuzz/fuzz/${target}_fuzzer" "${limits[@]}" -seed="$seed" -rss_limit_mb=2048 \
      -timeout=20 -print_final_stats=1 -artifact_prefix="$findings/$target-" \
      "$corpus" "fuzz/corpus/$target" 2>"build/fuzz/$target.log"; then
    status=1
    tail -n 40 "build/fuzz/$target.log"
  fi
  grep -E "^(Done|#[0-9]+ +DONE)|stat::number_of_executed_units" "build/fuzz/$target.log" || true
done
exit "$status"
