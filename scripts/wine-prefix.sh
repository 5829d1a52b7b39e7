#!/usr/bin/env bash
# Prepares the private Wine prefix once and keeps a wineserver alive for the
# test run, so that each Windows test process starts in milliseconds.
set -euo pipefail
export WINEPREFIX="${WINEPREFIX:-${TMPDIR:-/tmp}/fringe-wine-prefix}"
export WINEDEBUG=-all WINEDLLOVERRIDES="mscoree,mshtml="
if [ ! -f "$WINEPREFIX/system.reg" ]; then
  wineboot -i >/dev/null 2>&1 || true
fi
wineserver -p 600 >/dev/null 2>&1 || true
