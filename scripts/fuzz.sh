#!/usr/bin/env bash
# Builds the libFuzzer targets with clang (ASan+UBSan) and runs each for SECONDS (default
# 300), seeded from the corpus and the demo song. Findings land in build-fuzz/findings/;
# the exit status is non-zero when any target found one.
set -euo pipefail
cd "$(dirname "$0")/.."
seconds=${1:-300}
scripts/install-deps.sh
command -v clang++ >/dev/null || { echo "fuzz: clang++ is needed" >&2; exit 1; }

dir=build-fuzz
CC=clang CXX=clang++ cmake -S . -B "$dir" -DCMAKE_BUILD_TYPE=RelWithDebInfo -DONDREL_FUZZ=ON \
  -DONDREL_TESTS=OFF -DONDREL_BENCH=OFF >/dev/null
targets=(fuzz_otm fuzz_mod fuzz_s3m fuzz_mtm fuzz_sound fuzz_play)
cmake --build "$dir" -j "$(nproc)" --target "${targets[@]}" make_demo

corpus=../shared/corpus
seeds=$dir/seeds
rm -rf "$seeds"
mkdir -p "$seeds"/{otm,mod,s3m,mtm,sound,play} "$dir/findings"
"$dir/demo/make_demo" "$seeds/otm/demo.otm"
for f in "$corpus"/mod/* "$corpus"/malformed/*.mod; do [ -f "$f" ] && cp "$f" "$seeds/mod/"; done
for f in "$corpus"/s3m/* "$corpus"/malformed/*.s3m; do [ -f "$f" ] && cp "$f" "$seeds/s3m/"; done
for f in "$corpus"/mtm/* "$corpus"/malformed/*.mtm; do [ -f "$f" ] && cp "$f" "$seeds/mtm/"; done
# The sound and play targets take a first byte that picks the reader.
n=0
for f in "$corpus"/sound/*; do
  [ -f "$f" ] || continue
  case "$f" in *.avr) k='\x00';; *.aiff) k='\x01';; *.wav) k='\x02';; *) k='\x03';; esac
  { printf "$k"; cat "$f"; } > "$seeds/sound/$n"; n=$((n + 1))
done
{ printf '\x00'; cat "$seeds/otm/demo.otm"; } > "$seeds/play/otm"
for f in "$seeds"/mod/* "$seeds"/s3m/* "$seeds"/mtm/*; do
  [ -f "$f" ] || continue  # no corpus beside the checkout: the globs stay unexpanded
  case "$f" in */mod/*) k='\x01';; */s3m/*) k='\x06';; *) k='\x03';; esac
  { printf "$k"; head -c 60000 "$f"; } > "$seeds/play/$(basename "$f")"
done

status=0
for t in "${targets[@]}"; do
  name=${t#fuzz_}
  work=$dir/corpus/$name
  mkdir -p "$work"
  echo "== $t for ${seconds}s"
  if ! "$dir/fuzz/$t" -max_total_time="$seconds" -timeout=20 -rss_limit_mb=2048 -print_final_stats=0 \
      -artifact_prefix="$dir/findings/$name-" "$work" "$seeds/$name" 2>"$dir/$t.log"; then
    echo "fuzz: $t found a problem; see $dir/$t.log and $dir/findings/" >&2
    tail -n 30 "$dir/$t.log" >&2
    status=1
  fi
  grep -E "^#[0-9]+.*DONE|Done [0-9]+ runs" "$dir/$t.log" | tail -n 1 || true
done
exit $status
