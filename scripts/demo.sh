#!/usr/bin/env bash
# The main job: builds the program and its demo song, then shows the song.
set -euo pipefail
cd "$(dirname "$0")/.."
scripts/install-deps.sh
scripts/build.sh build -DONDREL_TESTS=OFF
build/ondrel info build/demo.otm
