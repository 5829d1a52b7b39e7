#!/usr/bin/env bash
# Prepares the private Wine prefix and starts its server and background services
# detached from any test's output, so that each Windows test starts in milliseconds
# and no test's pipe is held open by a Wine service. `wineserver -k` ends them.
set -euo pipefail
export WINEPREFIX="${WINEPREFIX:-${TMPDIR:-/tmp}/fringe-wine-prefix}"
export WINEDEBUG=-all WINEDLLOVERRIDES="mscoree,mshtml="
wineserver -p >/dev/null 2>&1 </dev/null || true
wineboot -i >/dev/null 2>&1 </dev/null || true
