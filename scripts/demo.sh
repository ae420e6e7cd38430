#!/usr/bin/env bash
# The main job: builds the program and its demo song, then opens the song in the desktop
# program where there is a display; elsewhere plays it on the sound card, or renders it to
# demo.wav where there is no sound device either.
set -euo pipefail
cd "$(dirname "$0")/.."
scripts/install-deps.sh
scripts/build.sh build -DONDREL_TESTS=ON
build/ondrel info build/demo.otm | head -n 7
if [ -n "${DISPLAY:-}${WAYLAND_DISPLAY:-}" ]; then
  status=0
  build/ondrel build/demo.otm || status=$?
  # 2: the display could not be opened after all; play it as below.
  [ "$status" -ne 2 ] && exit "$status"
fi
status=0
build/ondrel play build/demo.otm || status=$?
if [ "$status" -eq 3 ]; then
  echo "No sound device here: rendering the demo song to demo.wav instead."
  build/ondrel render build/demo.otm -o demo.wav
elif [ "$status" -ne 0 ]; then
  exit "$status"
fi
