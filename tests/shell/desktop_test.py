#!/usr/bin/env python3
"""The desktop program end to end, in a real window under Xvfb, driven with xdotool as a
person would drive it: open a song, play and stop with F5 and F8, write notes, save with
Ctrl+S, end with SIGTERM. Behaviour is checked in the files; pixels only loosely."""
import json
import os
import shutil
import subprocess
import sys
import tempfile
import time

from window_session import click, report, stop_by_signal

ONDREL, DEMO = sys.argv[1], sys.argv[2]
failures = []


def check(name, condition, detail=""):
    if not condition:
        failures.append(f"{name}: {detail}")


def run(*args, **kw):
    return subprocess.run(list(args), capture_output=True, text=True, timeout=30, **kw)


def wait_for(condition, seconds=10.0):
    end = time.time() + seconds
    while time.time() < end:
        if condition():
            return True
        time.sleep(0.1)
    return False


def screenshot(path):
    run("import", "-window", "root", path)
    return path


def region(path, x, y, w, h):
    """Raw RGB bytes of a rectangle of a screenshot."""
    return subprocess.run(["convert", path, "-crop", f"{w}x{h}+{x}+{y}", "rgb:-"],
                          capture_output=True, timeout=30).stdout


def sample_crc(path, index):
    info = json.loads(run(ONDREL, "info", "--json", path).stdout)
    return next((s["crc32"] for s in info["samples"] if s["index"] == index), None)


def song_cells(path):
    info = json.loads(run(ONDREL, "info", "--json", path).stdout)
    pattern = info["sequence"][0]
    for p in info["patterns"]:
        if p["index"] == pattern:
            return {(c[0], c[1]): c[2:] for c in p["cells"]}
    return {}


home = tempfile.mkdtemp(prefix="ondrel-desktop-")
env = dict(os.environ, HOME=home, XDG_CONFIG_HOME=os.path.join(home, "config"),
           XDG_STATE_HOME=os.path.join(home, "state"), SDL_AUDIODRIVER="dummy",
           ONDREL_RENDERER="software")
song = os.path.join(home, "song.otm")
shutil.copy(DEMO, song)
proc = subprocess.Popen([ONDREL, song], env=env, stdout=subprocess.PIPE, stderr=subprocess.PIPE, text=True)
window = ""
try:
    found = wait_for(lambda: run("xdotool", "search", "--pid", str(proc.pid), "--name", "Ondrel").stdout.strip())
    check("window opens", found, "no window of the program appeared")
    window = run("xdotool", "search", "--pid", str(proc.pid), "--name", "Ondrel").stdout.split()[0] if found else ""
    if window:
        run("xdotool", "windowfocus", "--sync", window)
        time.sleep(1.0)

        def key(*keys):
            run("xdotool", "key", "--window", window, *keys)
            time.sleep(0.25)

        first = screenshot(os.path.join(home, "start.png"))
        size = run("identify", "-format", "%w %h", first).stdout.split()
        check("screenshot size", size == ["1280", "800"], size)
        colours = run("identify", "-format", "%k", first).stdout.strip()
        check("window is drawn", colours.isdigit() and int(colours) > 8, f"{colours} colours")

        # The transport line shows the position, row and time: it moves while the song plays
        # and stands still once it is stopped.
        transport = (300, 26, 400, 22)
        key("F5")
        a = region(screenshot(os.path.join(home, "play1.png")), *transport)
        time.sleep(0.8)
        b = region(screenshot(os.path.join(home, "play2.png")), *transport)
        check("F5 plays", a != b, "the position did not move")
        key("F8")
        c = region(screenshot(os.path.join(home, "stop1.png")), *transport)
        time.sleep(0.6)
        d = region(screenshot(os.path.join(home, "stop2.png")), *transport)
        check("F8 stops", c == d, "the position still moves")

        # Edit mode, three notes typed at the cursor, saved with Ctrl+S.
        key("space")
        for k in ("z", "x", "c"):
            key(k)
        title = run("xdotool", "getwindowname", window).stdout.strip()
        check("the title shows unsaved changes", title == "Ondrel Tracker - Ondrel Morning *", title)
        key("ctrl+s")
        wait_for(lambda: song_cells(song).get((2, 0), [0])[0] == 64, 5)
        title = run("xdotool", "getwindowname", window).stdout.strip()
        check("and drops the mark once saved", title == "Ondrel Tracker - Ondrel Morning", title)
        cells = song_cells(song)
        check("typed notes saved", [cells.get((r, 0), [0])[0] for r in range(3)] == [60, 62, 64],
              [cells.get((r, 0)) for r in range(3)])
        check("with the current instrument", cells.get((0, 0), [0, 0, 0])[2] == 1, cells.get((0, 0)))
        for name in ("user.on_nopat", "user.on_v", "user.on_x", "user.on_y", "user.oftrack"):
            try:
                check(name, len(os.getxattr(song, name)) == 4)
            except OSError as e:
                check(name, False, str(e))

        # The sample editor: "Reverse" on the first instrument's sound, then saved.
        before = sample_crc(song, 1)
        click(window, (415, 502))  # the "Sample" tab
        screenshot(os.path.join(home, "sample.png"))
        click(window, (762, 525))  # "Reverse"
        key("ctrl+s")
        wait_for(lambda: sample_crc(song, 1) != before, 5)
        check("Reverse reached the saved sound", sample_crc(song, 1) not in (None, before), before)

        # One more note, then a signal: the change is kept as a recovery copy.
        key("v")
        time.sleep(0.3)
    status = stop_by_signal(proc)
    check("SIGTERM ends the program with status 0", status == 0, f"{status} {proc.stderr.read()[-400:]}")
    check("path file written", os.path.exists(os.path.join(home, "config", "ondrel", "ondrel.txt")))
    state = os.path.join(home, "state", "ondrel")
    check("recovery copy kept", os.path.isdir(state) and any(f.endswith(".otm") for f in os.listdir(state)),
          os.listdir(state) if os.path.isdir(state) else "no state directory")
finally:
    if proc.poll() is None:
        proc.kill()
sys.exit(report(home, failures))
