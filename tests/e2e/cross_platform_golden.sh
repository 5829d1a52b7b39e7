#!/bin/sh
# Runs the golden synthetic pages through the Windows module (under Wine) and
# compares every published value, the angle to the last bit, with what the
# native module answers for the same pages.
#   cross_platform_golden.sh EMULATOR WINDOWS_RUNNER NATIVE_RUNNER WORK_FOLDER
set -eu
emulator=$1
windows_runner=$2
native_runner=$3
work=$4
if [ ! -x "$native_runner" ]; then
  echo "no native runner at $native_runner: build the release preset first"
  exit 77
fi
mkdir -p "$work"
rm -f "$work/golden-windows.txt"
"$emulator" "$windows_runner" --golden "$work/golden-windows.txt"
"$native_runner" --compare "$work/golden-windows.txt"
