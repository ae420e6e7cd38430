#!/usr/bin/env bash
# Installs the Debian packages the build, the tests and the program need; packages that
# are already there are left alone, so running it again costs a second.
set -euo pipefail

# Two groups, installed in this order: the JACK server's development files must be in
# place before the MIDI library, or apt replaces one with the other.
packages_first=(
  build-essential cmake pkg-config python3
  libgtest-dev libbenchmark-dev zlib1g-dev libpng-dev
  libsdl2-dev libmagic-dev libimgui-dev
  clang libclang-rt-dev
  jackd2 libjack-jackd2-dev
  xvfb xauth xdotool imagemagick desktop-file-utils libxml2-utils shared-mime-info
)
packages_second=(
  librtmidi-dev libfluidsynth-dev timgm6mb-soundfont
)

missing_of() {
  local p
  for p in "$@"; do
    if ! dpkg-query -W -f='${Status}' "$p" 2>/dev/null | grep -q "install ok installed"; then
      printf '%s\n' "$p"
    fi
  done
}
mapfile -t first < <(missing_of "${packages_first[@]}")
mapfile -t second < <(missing_of "${packages_second[@]}")
[ ${#first[@]} -eq 0 ] && [ ${#second[@]} -eq 0 ] && exit 0
missing=("${first[@]}" "${second[@]}")

sudo=""
if [ "$(id -u)" -ne 0 ]; then
  if command -v sudo >/dev/null; then sudo="sudo"; else
    echo "install-deps: need root to install: ${missing[*]}" >&2
    exit 1
  fi
fi
echo "install-deps: installing ${missing[*]}"
export DEBIAN_FRONTEND=noninteractive
$sudo apt-get update -qq
[ ${#first[@]} -eq 0 ] || $sudo apt-get install -y -qq --no-install-recommends "${first[@]}"
[ ${#second[@]} -eq 0 ] || $sudo apt-get install -y -qq --no-install-recommends "${second[@]}"
