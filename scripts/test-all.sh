#!/usr/bin/env bash
# Builds every preset and runs every test: native, valgrind, the fuzz targets
# for a bounded time, sanitizers, Windows under Wine.
set -euo pipefail
cd "$(dirname "$0")/.."
jobs="${FRINGE_JOBS:-2}"

run_preset() {
  local preset="$1"
  echo "== $preset: configure and build"
  cmake --preset "$preset" >/dev/null
  cmake --build --preset "$preset" -j "$jobs"
  echo "== $preset: test"
  ctest --preset "$preset" -j "$jobs"
}

run_preset release
echo "== memcheck: one complete run under valgrind"
bash scripts/memcheck.sh
echo "== fuzz: every target for a bounded time"
FRINGE_JOBS="$jobs" FRINGE_FUZZ_CI=1 bash scripts/fuzz.sh "${FRINGE_FUZZ_SECONDS:-60}"
run_preset asan
bash scripts/wine-prefix.sh
run_preset windows
WINEPREFIX="${WINEPREFIX:-${TMPDIR:-/tmp}/fringe-wine-prefix}" wineserver -k >/dev/null 2>&1 || true
echo "== format"
bash scripts/check-format.sh
echo "all presets passed"
