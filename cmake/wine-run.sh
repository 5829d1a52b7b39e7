#!/bin/sh
# Runs a Windows test binary under Wine with a private, quiet prefix.
#
# Wine's background services (services.exe and the device hosts) inherit the
# standard output of whichever program starts them; started by a test, they would
# hold CTest's pipe open until its timeout. So they are started here, detached,
# before the first test, and kept with a persistent server for the rest of the run.
: "${WINEPREFIX:=${TMPDIR:-/tmp}/fringe-wine-prefix}"
export WINEPREFIX
export WINEDEBUG="${WINEDEBUG:--all}"
export WINEDLLOVERRIDES="${WINEDLLOVERRIDES:-mscoree,mshtml=}"
if ! pgrep -u "$(id -u)" -f 'system32.services\.exe' >/dev/null 2>&1; then
  wineserver -p >/dev/null 2>&1 </dev/null || true
  wine wineboot >/dev/null 2>&1 </dev/null || true
fi
exec wine "$@"
