#!/usr/bin/env bash
# Makes docs/screenshot.png, the picture in the README: the desktop program under Xvfb
# with the demo song playing. Needs a build (scripts/demo.sh or scripts/test.sh first).
set -euo pipefail
cd "$(dirname "$0")/.."
out=${1:-docs/screenshot.png}
[ -x build/ondrel ] && [ -f build/demo.otm ] || { echo "screenshot: build the program first" >&2; exit 1; }
home=$(mktemp -d)
trap 'rm -rf "$home"' EXIT
cat > "$home/shoot.sh" <<'INNER'
#!/usr/bin/env bash
set -euo pipefail
out=$1
# The browser opens on the corpus of modules where there is one, else on the project.
mkdir -p "$2/config/ondrel"
browse=$PWD/../shared/corpus/mod
[ -d "$browse" ] || browse=$PWD
printf '<Path>%s\n' "$browse" > "$2/config/ondrel/ondrel.txt"
HOME=$2 XDG_CONFIG_HOME=$2/config XDG_STATE_HOME=$2/state SDL_AUDIODRIVER=dummy ONDREL_RENDERER=software \
  build/ondrel build/demo.otm &
pid=$!
for _ in $(seq 50); do
  wid=$(xdotool search --pid "$pid" --name Ondrel 2>/dev/null | head -n 1 || true)
  [ -n "$wid" ] && break
  sleep 0.1
done
xdotool windowfocus --sync "$wid"
sleep 1
# The Sample tab, to show a waveform (a pointer warp alone is no motion to SDL here).
xdotool mousemove --window "$wid" 415 502 mousemove_relative 1 0
sleep 0.3
xdotool mousedown 1 && sleep 0.15 && xdotool mouseup 1
xdotool key --window "$wid" F5
sleep 2.5
import -window root "$out"
kill -TERM "$pid"
wait "$pid"
INNER
chmod +x "$home/shoot.sh"
case "$out" in /*) ;; *) out=$PWD/$out ;; esac
xvfb-run -a -s "-screen 0 1280x800x24" "$home/shoot.sh" "$out" "$home"
echo "screenshot: $out"
