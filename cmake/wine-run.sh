#!/bin/sh
# Runs a Windows test binary under Wine with a private, quiet prefix. The Wine
# server is kept for a few seconds after the last program ends, so that a run
# of many short test programs does not start it again for each one.
: "${WINEPREFIX:=${TMPDIR:-/tmp}/fringe-wine-prefix}"
export WINEPREFIX
export WINEDEBUG="${WINEDEBUG:--all}"
export WINEDLLOVERRIDES="${WINEDLLOVERRIDES:-mscoree,mshtml=}"
wineserver -p10 >/dev/null 2>&1 || true
exec wine "$@"
