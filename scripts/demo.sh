#!/usr/bin/env bash
# The main job: builds the program and its demo song, then plays the song on the sound
# card, or renders it to demo.wav where there is no sound device.
set -euo pipefail
cd "$(dirname "$0")/.."
scripts/install-deps.sh
scripts/build.sh build -DONDREL_TESTS=ON
build/ondrel info build/demo.otm | head -n 7
status=0
build/ondrel play build/demo.otm || status=$?
if [ "$status" -eq 3 ]; then
  echo "No sound device here: rendering the demo song to demo.wav instead."
  build/ondrel render build/demo.otm -o demo.wav
elif [ "$status" -ne 0 ]; then
  exit "$status"
fi
