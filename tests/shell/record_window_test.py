#!/usr/bin/env python3
"""The "FFT Window" and the recording panel in a real window under Xvfb, driven with the
mouse and keys as a person would: the analyser opens from the Windows menu and draws the
playing song, refreshing by itself; the song's own output is recorded through the panel to
a WAV file chosen in the file panel. The file is checked; pixels only loosely."""
import os
import struct
import subprocess
import sys
import tempfile
import time

from window_session import click, press, report, stop_by_signal

ONDREL, DEMO = sys.argv[1], sys.argv[2]
failures = []

# Where things are in the 1280 x 800 window.
WINDOWS_MENU, FFT_ITEM = (304, 10), (315, 85)
ANALYSER_IMAGE = (392, 200, 500, 255)  # inside the drawing, clear of the window's frame
RECORD_TAB = (601, 502)
SONG_SOURCE, D2D_FILE, CHOOSE = (440, 525), (733, 548), (845, 548)
PANEL_NAME_FIELD = (530, 591)
RECORD, STOP = (397, 598), (448, 598)


def check(name, condition, detail=""):
    if not condition:
        failures.append(f"{name}: {detail}")


def run(*args):
    return subprocess.run(list(args), capture_output=True, timeout=30)


def colours_in(png, box):
    """The distinct colours of a rectangle of a screenshot."""
    x, y, w, h = box
    raw = run("convert", png, "-crop", f"{w}x{h}+{x}+{y}", "rgb:-").stdout
    return {raw[i:i + 3] for i in range(0, len(raw), 3)}, raw


home = tempfile.mkdtemp(prefix="ondrel-record-window-")
env = dict(os.environ, HOME=home, XDG_CONFIG_HOME=os.path.join(home, "config"),
           XDG_STATE_HOME=os.path.join(home, "state"), SDL_AUDIODRIVER="dummy",
           ONDREL_RENDERER="software")
proc = subprocess.Popen([ONDREL, DEMO], env=env, stdout=subprocess.DEVNULL, stderr=subprocess.PIPE)
take = os.path.join(home, "take.wav")
try:
    window = ""
    for _ in range(100):
        window = run("xdotool", "search", "--pid", str(proc.pid), "--name", "Ondrel").stdout.split()
        if window:
            window = window[0].decode()
            break
        time.sleep(0.1)
    check("window opens", window, "no window of the program appeared")
    if window:
        run("xdotool", "windowfocus", "--sync", window)
        time.sleep(1.0)

        def shot(name):
            path = os.path.join(home, name + ".png")
            run("import", "-window", "root", path)
            return path

        # The analyser, then the song: it draws the spectrum and keeps drawing it.
        click(window, WINDOWS_MENU)
        click(window, FFT_ITEM)
        silent, _ = colours_in(shot("fft-silent"), ANALYSER_IMAGE)
        check("the analyser of silence is black", silent == {b"\0\0\0"}, f"{len(silent)} colours")
        run("xdotool", "key", "--window", window, "F5")
        # The song opens sparse, a bar or two at the left: wait for more of it (longer on a
        # loaded machine).
        for _ in range(8):
            time.sleep(0.5)
            drawn, first = colours_in(shot("fft-1"), ANALYSER_IMAGE)
            if len(drawn) > 3:
                break
        check("the analyser draws the song", len(drawn) > 3, f"{len(drawn)} colours")
        time.sleep(0.5)
        _, second = colours_in(shot("fft-2"), ANALYSER_IMAGE)
        check("the analyser refreshes by itself", first != second, "the drawing did not change")
        run("xdotool", "key", "--window", window, "F8")

        # The song's output to a file chosen in the file panel, while the song plays.
        click(window, RECORD_TAB)
        click(window, SONG_SOURCE)
        click(window, D2D_FILE)
        click(window, CHOOSE)
        click(window, PANEL_NAME_FIELD)
        press(window, "ctrl+a")
        run("xdotool", "type", "--window", window, "--delay", "40", take)
        time.sleep(0.3)
        press(window, "Return")
        click(window, RECORD)
        run("xdotool", "key", "--window", window, "F5")
        time.sleep(1.5)
        click(window, STOP)
        shot("recorded")
        run("xdotool", "key", "--window", window, "F8")

        data = open(take, "rb").read() if os.path.exists(take) else b""
        check("the recording is written", len(data) > 46 + 44100, f"{len(data)} bytes")
        if len(data) > 46:
            n = len(data) - 46
            fields = struct.unpack("<4sI4s4sIHHIIHHH4sI", data[:46])
            check("a stereo 16-bit WAV at 44100 Hz", fields[0] == b"RIFF" and fields[2] == b"WAVE" and
                  fields[6:8] == (2, 44100) and fields[10] == 16, fields)
            # The recorder's size fields, which count the header: data + 8 and data + 46.
            check("header sizes", (fields[1], fields[13]) == (n + 8, n + 46), (fields[1], fields[13], n))
            samples = struct.unpack(f"<{n // 2}h", data[46:46 + n // 2 * 2])
            check("the song is heard in it", max(abs(s) for s in samples) > 1000, "silent")
    status = stop_by_signal(proc)
    check("SIGTERM ends the program with status 0", status == 0, f"{status} {proc.stderr.read()[-400:]}")
    left = [f for f in os.listdir(home) if f.startswith("NewSound:")]
    check("no unused default file is left", not left, left)
finally:
    if proc.poll() is None:
        proc.kill()
sys.exit(report(home, failures))
