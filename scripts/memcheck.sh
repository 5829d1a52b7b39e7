#!/usr/bin/env bash
# One complete filter run (parameters, prepare, start, continue, finish) of the
# release module through the runner, under valgrind's memcheck. Any memcheck
# error, any definitely or indirectly lost block, or a failing run fails.
set -euo pipefail
cd "$(dirname "$0")/.."
jobs="${FRINGE_JOBS:-2}"
build="${1:-build/release}"

if [ ! -x "$build/bin/fringe-runner" ]; then
  cmake --preset release >/dev/null
  cmake --build "$build" -j "$jobs" --target fringe-runner Fringe
fi
export FRINGE_ALERT_LOG=/dev/null
valgrind --tool=memcheck --error-exitcode=99 --leak-check=full \
  --errors-for-leak-kinds=definite,indirect --show-leak-kinds=definite,indirect \
  --track-origins=yes --quiet \
  "$build/bin/fringe-runner" --size 400x300 --photo 200,150,220,150,8
echo "memcheck: no errors"
