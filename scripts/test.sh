#!/usr/bin/env bash
# Builds and runs every test: a normal build, then the same suite under ASan+UBSan and
# under ThreadSanitizer.
set -euo pipefail
cd "$(dirname "$0")/.."
scripts/install-deps.sh

echo "== build and test"
scripts/build.sh build -DONDREL_TESTS=ON -DONDREL_WERROR=ON
(cd build && ctest --output-on-failure -j "$(nproc)")

echo "== build and test under ASan+UBSan"
BUILD_TYPE=Debug scripts/build.sh build-asan -DONDREL_TESTS=ON -DONDREL_BENCH=OFF -DONDREL_SANITIZE=address \
  -DONDREL_WERROR=ON
(cd build-asan && ASAN_OPTIONS=detect_leaks=1:abort_on_error=1 UBSAN_OPTIONS=print_stacktrace=1 \
   ctest --output-on-failure -j "$(nproc)")

echo "== build and test under ThreadSanitizer"
scripts/build.sh build-tsan -DONDREL_TESTS=ON -DONDREL_BENCH=OFF -DONDREL_SANITIZE=thread -DONDREL_WERROR=ON
# FluidSynth loads samples on OpenMP threads whose barriers ThreadSanitizer cannot see: one
# thread keeps those runs in order. JACK's ring buffer is the one other library structure
# it misreads (tests/tsan_suppressions.txt).
suppressions="$PWD/tests/tsan_suppressions.txt"
(cd build-tsan && OMP_NUM_THREADS=1 \
   TSAN_OPTIONS="halt_on_error=1 suppressions=$suppressions" \
   ctest --output-on-failure -j "$(nproc)")
