#!/usr/bin/env bash
# Gathers real modules that no one here wrote from Debian's game packages (their music),
# into DIR/mod and DIR/s3m, for the peer benchmark: build-bench/bench/bench_peers --corpus DIR.
# The packages are downloaded, not installed.
set -euo pipefail
dir=${1:-build-bench/wider-set}
packages=(tecnoballz-data ri-li-data pingus-data njam-data bb gl-117-data gweled madbomber-data
          monsterz-data pachi-data pathogen penguin-command vectoroids)
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
chmod 755 "$work"  # apt fetches as its own user
mkdir -p "$dir/mod" "$dir/s3m"
if ! (cd "$work" && apt-get download "${packages[@]}" >/dev/null 2> >(grep -v unsandboxed >&2)); then
  echo "wider-set: the packages could not be fetched (apt-get update first?)" >&2
  exit 1
fi
for deb in "$work"/*.deb; do dpkg-deb -x "$deb" "$work/root"; done
find "$work/root" -type f -iname '*.mod' -exec cp {} "$dir/mod/" \;
find "$work/root" -type f -iname '*.s3m' -exec cp {} "$dir/s3m/" \;
echo "$(find "$dir" -type f | wc -l) modules in $dir"
