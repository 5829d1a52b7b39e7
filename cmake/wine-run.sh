#!/bin/sh
# Runs a Windows test binary under Wine with a private, quiet prefix.
: "${WINEPREFIX:=${TMPDIR:-/tmp}/fringe-wine-prefix}"
export WINEPREFIX
export WINEDEBUG="${WINEDEBUG:--all}"
export WINEDLLOVERRIDES="${WINEDLLOVERRIDES:-mscoree,mshtml=}"
exec wine "$@"
