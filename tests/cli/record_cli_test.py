#!/usr/bin/env python3
"""ondrel record and ondrel spectrogram end to end, on SDL's dummy and disk drivers."""
import array
import os
import struct
import subprocess
import sys
import tempfile

ONDREL, DEMO = sys.argv[1], sys.argv[2]
failures = []


def run(*args, driver=None, **extra):
    env = dict(os.environ, **extra)
    env.pop("SDL_AUDIODRIVER", None)
    if driver:
        env["SDL_AUDIODRIVER"] = driver
    return subprocess.run([ONDREL, *args], capture_output=True, text=True, timeout=120, env=env,
                          stdin=subprocess.DEVNULL)


def check(name, condition, detail=""):
    if not condition:
        failures.append(f"{name}: {detail}")


def u32(data, at):
    return struct.unpack_from("<I", data, at)[0]


def recording(path):
    """The data of a disk recording, after checking its header against its length."""
    data = open(path, "rb").read()
    n = len(data) - 46
    check(f"{path} RIFF size", u32(data, 4) == n + 8, (u32(data, 4), n))
    check(f"{path} data size", u32(data, 42) == n + 46, (u32(data, 42), n))
    check(f"{path} tags", data[:4] == b"RIFF" and data[8:16] == b"WAVEfmt " and data[38:42] == b"data", data[:46])
    return data[46:]


with tempfile.TemporaryDirectory() as tmp:
    # The song's own output, recorded as it plays, is the render of the song: over a time
    # limit, and to the song's end (short songs of the corpus, when it is there).
    corpus = os.path.normpath(os.path.join(os.getcwd(), "..", "shared", "corpus", "s3m"))
    songs = [(DEMO, "3")] + [(os.path.join(corpus, name), None) for name in ("stereo.s3m", "pattern_jump_st3_break.s3m")
                             if os.path.exists(os.path.join(corpus, name))]
    if len(songs) == 1:
        print("corpus songs not here: recordings to a song's end not checked")
    for song, seconds in songs:
        rec, ren = os.path.join(tmp, "rec.wav"), os.path.join(tmp, "ren.wav")
        limit = ["--seconds", seconds] if seconds else []
        name = f"record --song {os.path.basename(song)} {' '.join(limit)}"
        r = run("record", "--song", song, "-o", rec, *limit, driver="dummy")
        check(f"{name} exit", r.returncode == 0, r.stderr)
        check(f"{name} says why it stopped", ("time limit" if seconds else "end of the song") in r.stderr, r.stderr)
        check(f"{name}: the recorder's notes on standard output",
              r.stdout.startswith("ecrit entete d2D !!! \n") and "stoppe enreigstre\n" in r.stdout, r.stdout)
        r = run("render", song, "-o", ren, *(["--max-seconds", seconds] if seconds else []))
        check("render exit", r.returncode == 0, r.stderr)
        recorded, rendered = recording(rec), open(ren, "rb").read()[44:]
        check(f"{name} holds the render's frames", recorded == rendered, (len(recorded), len(rendered)))

    # The input, fed by SDL's disk driver with a known ramp: every frame once, in order.
    ramp = os.path.join(tmp, "in.raw")
    with open(ramp, "wb") as f:
        f.write(b"".join(struct.pack("<hh", (i % 65536) - 32768, 1000) for i in range(44100 * 2)))
    cases = [("stereo16", "128", 4, lambda l, r_: struct.pack("<hh", l, r_)),
             ("mono8", "256", 1, lambda l, r_: bytes([(((l >> 8) * 2) & 0xff) ^ 0x80]))]
    for mode, gain, align, convert in cases:
        out = os.path.join(tmp, f"input-{mode}.wav")
        r = run("record", "-o", out, "--seconds", "0.5", "--mode", mode, "--gain", gain, driver="disk",
                SDL_DISKAUDIOFILEIN=ramp)
        check(f"record input {mode} exit", r.returncode == 0, r.stderr)
        data = recording(out) if os.path.exists(out) else b""
        check(f"record input {mode} length", len(data) == 22050 * align, len(data))
        if len(data) == 22050 * align:
            # Where the ramp was when the recording began: found from the first frames.
            found = [k for k in range(0, 44100 - 22050)
                     if all(convert((k + i) % 65536 - 32768, 1000) == data[i * align:(i + 1) * align] for i in range(4))]
            expect = b"".join(convert((found[0] + i) % 65536 - 32768, 1000) for i in range(22050)) if found else b""
            check(f"record input {mode} holds the ramp", data == expect, found[:3])

    # No device, no file; a file that cannot be made; usage.
    out = os.path.join(tmp, "none.wav")
    r = run("record", "--song", DEMO, "-o", out, driver="nosuchdriver")
    check("no sound device exits 3", r.returncode == 3 and not os.path.exists(out), (r.returncode, r.stderr))
    r = run("record", "-o", out, "--device", "No Such Input", driver="dummy")
    check("an unknown input exits 3", r.returncode == 3 and "No Such Input" in r.stderr, (r.returncode, r.stderr))
    r = run("record", "--song", DEMO, "-o", os.path.join(tmp, "no", "dir", "x.wav"), driver="dummy")
    check("a file that cannot be made exits 1", r.returncode == 1, (r.returncode, r.stderr))
    check("... with the recorder's alert", "Cannot create the recording file: No such file or directory." in r.stdout,
          r.stdout)
    for bad in (["record"], ["record", "-o", out, "--mode", "quad"], ["record", "-o", out, "--gain", "-1"],
                ["record", "-o", out, "--seconds", "0"]):
        check(f"{bad} exits 2", run(*bad).returncode == 2)
    check("record help", run("record", "--help").returncode == 0)
    r = run("record", "--list-devices", driver="disk")
    check("list devices", r.returncode == 0 and r.stdout.strip() != "", (r.returncode, r.stdout))

    # The spectrogram: one row of 512 columns for every 75 ms of the song.
    png = os.path.join(tmp, "demo.png")
    r = run("spectrogram", DEMO, "-o", png, "--max-seconds", "6")
    check("spectrogram exit", r.returncode == 0, r.stderr)
    head = open(png, "rb").read(33) if os.path.exists(png) else b""
    check("a PNG", head[:8] == b"\x89PNG\r\n\x1a\n" and head[12:16] == b"IHDR", head)
    if len(head) == 33:
        width, height = struct.unpack(">II", head[16:24])
        check("spectrogram size", (width, height) == (512, 80), (width, height))
        check("8-bit RGB", head[24:26] == b"\x08\x02", head[24:26])
    check("spectrogram of nothing", run("spectrogram", os.path.join(tmp, "missing.otm"), "-o", png).returncode == 1)
    check("spectrogram usage", run("spectrogram", DEMO).returncode == 2)

if failures:
    print("\n".join(failures))
    print(f"{len(failures)} failed")
    sys.exit(1)
print("record checks passed")
