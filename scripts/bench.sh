#!/usr/bin/env bash
# Every performance figure in one run, each beside its target:
#   1. the analysis chain against the floor loop on both benchmark pages, with
#      each stage's share and the OpenCV contour detector where it is built
#      (fringe_bench, best of the repetitions);
#   2. fringe detect on a 2000 x 1500 PNG against libvips decoding the same
#      file, side by side (hyperfine), and its peak memory against three
#      decoded frames plus 64 MiB (GNU time);
#   3. a batch of 100 pages with two workers against one;
#   4. the chain of the Windows build under Wine against the native one, when
#      build/windows holds the chain timer.
# Builds the release preset's benchmark and tool first. Other work on the
# machine slows every figure: the load average is printed with each part.
#
#   scripts/bench.sh            FRINGE_BENCH_REPETITIONS (5), FRINGE_BENCH_RUNS (10)
set -euo pipefail
cd "$(dirname "$0")/.."

repetitions="${FRINGE_BENCH_REPETITIONS:-5}"
runs="${FRINGE_BENCH_RUNS:-10}"
bin=build/release/bin
work="$(mktemp -d)"
trap 'rm -rf "$work"' EXIT

for tool in hyperfine vips jq /usr/bin/time; do
  command -v "$tool" >/dev/null || { echo "bench.sh: $tool is needed" >&2; exit 1; }
done

cmake --preset release >/dev/null
cmake --build --preset release -j "${FRINGE_JOBS:-2}" --target fringe_bench fringe_chain_timer \
  fringe Fringe >/dev/null

load() { echo "(load average $(cut -d' ' -f1-3 /proc/loadavg))"; }
# verdict VALUE OP LIMIT: "met" or "NOT met".
verdict() { awk -v v="$1" -v l="$3" -v op="$2" \
  'BEGIN { ok = (op == "<=") ? (v <= l) : (v >= l); print ok ? "met" : "NOT met" }'; }
ratio() { awk -v a="$1" -v b="$2" 'BEGIN { printf "%.2f", a / b }'; }

echo "== 1. Analysis chain against the floor loop $(load)"
"$bin/fringe_bench" --benchmark_min_time=0.2 --benchmark_repetitions="$repetitions" \
  --benchmark_report_aggregates_only=false | tee "$work/chain.txt" |
  sed -n '/^CPU time per frame/,$p'

echo
echo "== 2. fringe detect against libvips decoding the same file $(load)"
page="$work/page.png"
vips thumbnail samples/scan.jpg "$page" 2000 --height 1500 --size force
echo "page: $(vipsheader "$page")"
hyperfine -N --warmup 3 --runs "$((runs * 2))" --export-json "$work/tool.json" \
  "vips avg $page" "$bin/fringe detect -q $page" "$bin/fringe detect -q --raw $page" \
  >"$work/hyperfine.txt"
median() { jq -r ".results[$1].median" "$work/tool.json"; }
decode="$(median 0)"
detect="$(median 1)"
raw="$(median 2)"
printf '  vips avg (decode, one read)   %8.1f ms\n' "$(awk -v t="$decode" 'BEGIN { print t * 1000 }')"
printf '  fringe detect                 %8.1f ms\n' "$(awk -v t="$detect" 'BEGIN { print t * 1000 }')"
printf '  fringe detect --raw           %8.1f ms\n' "$(awk -v t="$raw" 'BEGIN { print t * 1000 }')"
detectRatio="$(ratio "$detect" "$decode")"
echo "  detect / decode        $detectRatio  (at most 1.3: $(verdict "$detectRatio" "<=" 1.3))"
echo "  detect --raw / decode  $(ratio "$raw" "$decode")"

peak=0
for _ in 1 2 3; do
  kb="$(/usr/bin/time -f %M "$bin/fringe" detect -q "$page" 2>&1 >/dev/null | tail -n 1)"
  ((kb > peak)) && peak=$kb
done
frame=$((2000 * 1500 * 3))
limit=$((3 * frame + 64 * 1024 * 1024))
peakBytes=$((peak * 1024))
echo "  peak RSS $((peakBytes / 1048576)) MiB, limit 3 x $((frame / 1000)) kB + 64 MiB =" \
  "$((limit / 1048576)) MiB: $(verdict "$peakBytes" "<=" "$limit")"

echo
echo "== 3. 100 pages, two workers against one $(load)"
mkdir "$work/batch"
for i in $(seq -w 1 100); do cp "$page" "$work/batch/page$i.png"; done
hyperfine -N --warmup 1 --runs "$((runs / 2 > 2 ? runs / 2 : 3))" --export-json "$work/batch.json" \
  "$bin/fringe detect -q -j1 $work/batch" "$bin/fringe detect -q -j2 $work/batch" \
  >"$work/batch.txt"
one="$(jq -r '.results[0].median' "$work/batch.json")"
two="$(jq -r '.results[1].median' "$work/batch.json")"
printf '  -j1 %.2f s, -j2 %.2f s\n' "$one" "$two"
speedup="$(ratio "$one" "$two")"
echo "  throughput -j2 / -j1  $speedup  (at least 1.8: $(verdict "$speedup" ">=" 1.8))"

echo
echo "== 4. The chain under Wine against the native chain $(load)"
exe=build/windows/bin/fringe_chain_timer.exe
if [[ -f "$exe" ]] && command -v wine >/dev/null; then
  "$bin/fringe_chain_timer" "$((runs * 3))" | tee "$work/native.txt"
  sh cmake/wine-run.sh "$exe" "$((runs * 3))" | tr -d '\r' | tee "$work/wine.txt"
  join <(tail -n +2 "$work/native.txt" | awk '{ print $1, $2 }' | sort) \
    <(tail -n +2 "$work/wine.txt" | awk '{ print $1, $2 }' | sort) |
    while read -r name native wine; do
      echo "  $name  Wine / native chain $(ratio "$wine" "$native")"
    done
else
  echo "  skipped: build the windows preset's fringe_chain_timer and install Wine"
fi
