#!/usr/bin/env bash
# Builds everything (native release) and runs the main job: fringe finds the
# photo on the sample scan, draws its outline and writes it straightened.
set -euo pipefail
cd "$(dirname "$0")/.."
cmake --preset release >/dev/null
cmake --build --preset release -j "${FRINGE_JOBS:-2}"
mkdir -p out
build/release/bin/fringe all samples/scan.jpg -o out
echo "wrote out/scan.outline.jpg (the outline on the page) and out/scan.photo.jpg (the photo)"
