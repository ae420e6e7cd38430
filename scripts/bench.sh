#!/usr/bin/env bash
# Benchmarks: our renderer against two peer players over the corpus (median of RUNS runs),
# each effect unit's cost per second of audio, the fixed cost of one output buffer, what
# each pattern edit and its undo cost, and the desktop window's cost per frame.
set -euo pipefail
cd "$(dirname "$0")/.."
scripts/install-deps.sh
extra=()
for p in libopenmpt-dev libxmp-dev libbenchmark-dev; do
  dpkg-query -W -f='${Status}' "$p" 2>/dev/null | grep -q "install ok installed" || extra+=("$p")
done
if [ ${#extra[@]} -gt 0 ]; then
  sudo=""; [ "$(id -u)" -ne 0 ] && sudo="sudo"
  $sudo apt-get update -qq && $sudo apt-get install -y -qq --no-install-recommends "${extra[@]}"
fi
BUILD_TYPE=Release scripts/build.sh build-bench -DONDREL_TESTS=OFF -DONDREL_BENCH=ON
build-bench/bench/bench_peers --runs "${RUNS:-5}"
build-bench/bench/bench_effects --benchmark_min_time=0.5
build-bench/bench/bench_buffer --benchmark_min_time=0.5
build-bench/bench/bench_edits
# The desktop window's cost per frame, in a virtual display.
xvfb-run -a -s '-screen 0 1280x800x24' build-bench/bench/bench_gui_frame
