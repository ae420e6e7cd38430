#!/usr/bin/env bash
# A long recording of a song's own output, made in real time on SDL's dummy driver,
# against the offline render of the same song: every frame must be the same, none dropped,
# doubled or shifted. Not part of CI: it takes as long as the song (about 11 minutes with
# the defaults: inside_out.s3m with one sequencer step per 1200-frame buffer).
#   bench/record_vs_render.sh [BUILD_DIR] [SONG] [options for both commands...]
set -euo pipefail
cd "$(dirname "$0")/.."
build=${1:-build}
song=${2:-../shared/corpus/s3m/inside_out.s3m}
shift $(( $# > 2 ? 2 : $# ))
options=("$@")
[ ${#options[@]} -eq 0 ] && options=(--no-tempo --buffer 1200)
[ -f "$song" ] || { echo "record_vs_render: no song at $song" >&2; exit 1; }
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT

"$build/ondrel" render "$song" -o "$work/render.wav" --quiet "${options[@]}"
started=$(date +%s)
SDL_AUDIODRIVER=dummy "$build/ondrel" record --song "$song" -o "$work/record.wav" --quiet "${options[@]}" >"$work/notes.txt"
took=$(( $(date +%s) - started ))
python3 - "$work/render.wav" "$work/record.wav" "$took" <<'PY'
import struct, sys
render, record = open(sys.argv[1], "rb").read()[44:], open(sys.argv[2], "rb").read()
header, data = record[:46], record[46:]
n = len(data)
ok_header = struct.unpack_from("<I", header, 4)[0] == n + 8 and struct.unpack_from("<I", header, 42)[0] == n + 46
first = next((i for i in range(0, min(n, len(render)), 4) if data[i:i + 4] != render[i:i + 4]), None)
print(f"recorded {n // 4} frames ({n / 176400:.1f} s) in {sys.argv[3]} s of real time, {n // 705600} turns of the ring; "
      f"render {len(render) // 4} frames; header {'matches' if ok_header else 'DOES NOT match'} the length")
if first is not None or n != len(render) or not ok_header:
    print(f"MISMATCH: first differing frame {None if first is None else first // 4}")
    sys.exit(1)
print("every frame the same")
PY
