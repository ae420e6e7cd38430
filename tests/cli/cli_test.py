#!/usr/bin/env python3
"""The ondrel command line end to end: exit codes, messages and the JSON report."""
import json
import os
import stat
import subprocess
import sys
import tempfile

ONDREL, DEMO = sys.argv[1], sys.argv[2]
failures = []


def run(*args):
    return subprocess.run([ONDREL, *args], capture_output=True, text=True, timeout=60)


def check(name, condition, detail=""):
    if not condition:
        failures.append(f"{name}: {detail}")


def json_report(path):
    r = run("info", "--json", path)
    check("info --json exit", r.returncode == 0, r.stderr)
    return json.loads(r.stdout)


# The demo song, as scripts see it (its fields are checked against an expected file by
# the cli test program).
demo = json_report(DEMO)
check("demo name", demo["name"] == "Ondrel Morning", demo["name"])

# Text report.
r = run("info", DEMO)
check("info exit", r.returncode == 0, r.stderr)


for needle in ("Ondrel Morning", "Patterns:", "Samples:", "kick", "125.00 BPM"):
    check(f"text has {needle}", needle in r.stdout, r.stdout[:400])

with tempfile.TemporaryDirectory() as tmp:
    # convert writes a file that reads back the same.
    out = os.path.join(tmp, "copy.otm")
    r = run("convert", DEMO, "-o", out)
    check("convert exit", r.returncode == 0, r.stderr)
    check("convert round trip", json_report(out) == demo)

    # Bad input: one line on stderr, exit 1, nothing on stdout.
    packed = os.path.join(tmp, "packed.otm")
    with open(packed, "wb") as f:
        f.write(b"PP20" + bytes(64))
    junk = os.path.join(tmp, "junk.otm")
    with open(junk, "wb") as f:
        f.write(os.urandom(3) + b"\x00" * 40)
    for path in (packed, junk, os.path.join(tmp, "missing.otm")):
        r = run("info", path)
        check(f"{path} exit 1", r.returncode == 1, r.returncode)
        check(f"{path} one line", r.stderr.count("\n") == 1 and r.stderr.startswith("ondrel: "), r.stderr)
        check(f"{path} no output", r.stdout == "", r.stdout)
    check("packer named", "packed" in run("info", packed).stderr)

    # A truncated file keeps what was read and says so.
    with open(DEMO, "rb") as f:
        data = f.read()
    cut = os.path.join(tmp, "cut.otm")
    with open(cut, "wb") as f:
        f.write(data[: len(data) // 2])
    r = run("info", "--json", cut)
    check("truncated exit", r.returncode == 0, r.stderr)
    check("truncated warning", "ends early" in r.stderr, r.stderr)
    check("truncated keeps the head", json.loads(r.stdout)["name"] == "Ondrel Morning")

# Offline render, read back with an independent WAV reader.
import array
import math
import wave

with tempfile.TemporaryDirectory() as tmp:
    out = os.path.join(tmp, "demo.wav")
    r = run("render", DEMO, "-o", out)
    check("render exit", r.returncode == 0, r.stderr)
    check("render says where it stopped", "end of the song" in r.stderr, r.stderr)
    with wave.open(out) as w:
        check("wav stereo", w.getnchannels() == 2)
        check("wav rate", w.getframerate() == 44100)
        check("wav 16-bit", w.getsampwidth() == 2)
        seconds = w.getnframes() / 44100
        # 6 positions of 64 rows at 125 BPM, speed 6 (the last rows at 100 BPM).
        check("demo length", 44 < seconds < 50, seconds)
        pcm = array.array("h", w.readframes(w.getnframes()))
    peak = max(abs(x) for x in pcm) / 32767
    rms = math.sqrt(sum(x * x for x in pcm[::7]) / len(pcm[::7])) / 32767
    check("demo is heard", rms > 0.02, rms)
    check("demo does not clip", peak < 0.99, peak)
    left, right = pcm[0::2], pcm[1::2]
    check("demo is stereo", any(a != b for a, b in zip(left[44100:88200], right[44100:88200])))

    short = os.path.join(tmp, "short.wav")
    r = run("render", DEMO, "-o", short, "--max-seconds", "1.5", "--float", "--quality", "interpolation")
    check("limited render", r.returncode == 0, r.stderr)
    with open(short, "rb") as f:
        head = f.read(64)
    check("float wav format tag", head[20:22] == b"\x03\x00", head[:40])
    check("float wav length", os.path.getsize(short) == 58 + 66150 * 8, os.path.getsize(short))

    check("render without -o", run("render", DEMO).returncode == 2)
    check("render bad option value", run("render", DEMO, "-o", short, "--pitch", "500").returncode == 2)
    missing_dir = os.path.join(tmp, "no", "such", "dir", "x.wav")
    r = run("render", DEMO, "-o", missing_dir)
    check("render to a missing folder", r.returncode == 1 and r.stderr.startswith("ondrel: "), r.stderr)

    # Where the sound goes: standard output (a pipe, or a file it was redirected to), devices.
    def render_to(stdout, *extra):
        return subprocess.run([ONDREL, "render", DEMO, "-o", "-", "--max-seconds", "1", "--quiet", *extra],
                              stdout=stdout, stderr=subprocess.PIPE, timeout=60)

    r = render_to(subprocess.PIPE)
    unknown = b"\xff" * 4
    check("render to a pipe", r.returncode == 0 and r.stdout[:4] == b"RIFF" and r.stdout[4:8] == unknown
          and r.stdout[40:44] == unknown and len(r.stdout) == 44 + 44100 * 4, (r.returncode, r.stdout[:44]))
    redirected = os.path.join(tmp, "redirected.wav")
    with open(redirected, "wb") as f:
        f.write(b"abc")
        f.flush()
        render_to(f)
    with open(redirected, "rb") as f:
        data = f.read()
    check("standard output redirected to a file gets the real sizes",
          data[:3] == b"abc" and int.from_bytes(data[43:47], "little") == 44100 * 4, data[:47])
    p = subprocess.Popen([ONDREL, "render", DEMO, "-o", "-", "--quiet"], stdout=subprocess.PIPE,
                         stderr=subprocess.PIPE)
    p.stdout.read(100)
    p.stdout.close()
    err = p.stderr.read().decode()
    check("a reader that leaves", p.wait(timeout=60) == 1
          and err == "ondrel: cannot write standard output: Broken pipe\n", (p.returncode, err))
    for device, ok in (("/dev/null", True), ("/dev/full", False)):
        if os.path.exists(device):
            r = run("render", DEMO, "-o", device, "--max-seconds", "1", "--quiet")
            want = "" if ok else f"ondrel: cannot write {device}: No space left on device\n"
            check(f"render to {device}", r.returncode == (0 if ok else 1) and r.stderr == want
                  and stat.S_ISCHR(os.stat(device).st_mode), (r.returncode, r.stderr))

    # The song as a MIDI file: format 1, 960 ticks a quarter, tracks as the header counts.
    mid = os.path.join(tmp, "demo.mid")
    r = run("export-midi", DEMO, "-o", mid)
    data = open(mid, "rb").read() if os.path.exists(mid) else b""
    check("export-midi", r.returncode == 0 and data[:4] == b"MThd" and data[8:14] == bytes([0, 1, 0, 7, 3, 0xC0])
          and data.count(b"MTrk") == 7 and "end of the song" in r.stderr, (r.stderr, data[:14]))
    for args, code in ((["--help"], 0), ([DEMO], 2), ([os.path.join(tmp, "missing.otm"), "-o", mid], 1),
                       ([DEMO, "-o", missing_dir], 1)):
        check(f"export-midi {args}", run("export-midi", *args).returncode == code)

    # The synthesiser idle (the demo has no MIDI track) adds nothing; a SoundFont that is not
    # there stops the command before it writes.
    if os.path.exists("/usr/share/sounds/sf2/TimGM6mb.sf2"):
        synth_out = os.path.join(tmp, "synth.wav")
        r = run("render", DEMO, "-o", synth_out, "--max-seconds", "1.5", "--float", "--quality",
                "interpolation", "--midi-synth")
        check("render --midi-synth", r.returncode == 0 and open(synth_out, "rb").read() == open(short, "rb").read(),
              r.stderr)
    r = run("render", DEMO, "-o", os.path.join(tmp, "none.wav"), "--midi-synth", "/no/such.sf2")
    check("render --midi-synth with a missing SoundFont", r.returncode == 1 and r.stderr.count("\n") == 1
          and not os.path.exists(os.path.join(tmp, "none.wav")), r.stderr)

    # Live play through SDL's dummy and disk drivers (no sound card needed).
    env = dict(os.environ, SDL_AUDIODRIVER="dummy")
    r = subprocess.run([ONDREL, "play", DEMO, "--max-seconds", "1"], capture_output=True, text=True,
                       timeout=30, env=env, stdin=subprocess.DEVNULL)
    check("play on the dummy driver", r.returncode == 0 and "time limit" in r.stderr, r.stderr)
    raw = os.path.join(tmp, "out.raw")
    env = dict(os.environ, SDL_AUDIODRIVER="disk", SDL_DISKAUDIOFILE=raw)
    r = subprocess.run([ONDREL, "play", DEMO, "--max-seconds", "1"], capture_output=True, text=True,
                       timeout=30, env=env, stdin=subprocess.DEVNULL)
    check("play on the disk driver", r.returncode == 0, r.stderr)
    samples = array.array("f", open(raw, "rb").read()) if os.path.exists(raw) else array.array("f")
    check("the disk driver heard the song", len(samples) > 44100 and max(map(abs, samples)) > 0.05,
          len(samples))
    env = dict(os.environ, SDL_AUDIODRIVER="nosuchdriver")
    r = subprocess.run([ONDREL, "play", DEMO], capture_output=True, text=True, timeout=30, env=env,
                       stdin=subprocess.DEVNULL)
    check("no device exits 3", r.returncode == 3, (r.returncode, r.stderr))
    check("no device says render", "render" in r.stderr and r.stderr.count("\n") == 1, r.stderr)

# Sounds: the record a file becomes, and a song built from a script.
SOUNDS = os.path.normpath(os.path.join(os.getcwd(), "..", "shared", "corpus", "sound"))
wav_path = os.path.join(SOUNDS, "buzz.wav")
if os.path.exists(wav_path):
    r = run("info", "--json", wav_path)
    check("sound info exit", r.returncode == 0, r.stderr)
    sound = json.loads(r.stdout)
    check("sound named after its file", sound["name"] == "buzz", sound["name"])
    check("sound rate", sound["rate"] == 22050)
    with tempfile.TemporaryDirectory() as tmp:
        out = os.path.join(tmp, "with-buzz.otm")
        r = run("set-sound", DEMO, "7", wav_path, "-o", out)
        check("set-sound exit", r.returncode == 0, r.stderr)
        song = json_report(out)
        slot7 = [x for x in song["samples"] if x["index"] == 7]
        check("slot 7 holds the sound", slot7 and slot7[0]["name"] == "buzz" and slot7[0]["crc32"] == sound["crc32"],
              slot7)
        check("the rest of the song stays", len(song["samples"]) == 7 and song["name"] == "Ondrel Morning")
        check("set-sound bad slot", run("set-sound", DEMO, "0", wav_path, "-o", out).returncode == 2)
        text = os.path.join(tmp, "notes.txt")
        with open(text, "w") as f:
            f.write("hello\n" * 200)
        r = run("set-sound", DEMO, "1", text, "-o", out)
        check("set-sound refuses other files", r.returncode == 1 and "I don't use this file" in r.stderr, r.stderr)
        r = run("info", text)
        check("info refuses other files", r.returncode == 1 and "I don't use this file" in r.stderr, r.stderr)
else:
    print("corpus sounds not here: sound checks skipped")

# edit-sound: the sample editor's tools on one sound, the rest of the song kept.
with tempfile.TemporaryDirectory() as tmp:
    first = demo["samples"][0]
    slot, frames = str(first["index"]), first["length"] >> first["framecode"]
    out = os.path.join(tmp, "edited.otm")

    def samples_after(*args):
        r = run("edit-sound", *args, "-o", out)
        check(f"edit-sound {args} exit", r.returncode == 0 and r.stderr == "", r.stderr)
        return {x["index"]: x for x in json_report(out)["samples"]}

    before = {x["index"]: x for x in demo["samples"]}
    after = samples_after(DEMO, slot, "reverse")
    check("reverse changes that sound only", after[first["index"]]["crc32"] != first["crc32"]
          and all(after[i] == before[i] for i in before if i != first["index"]))
    twice = os.path.join(tmp, "twice.otm")
    os.replace(out, twice)
    check("reverse twice gives the sound back", samples_after(twice, slot, "reverse") == before)
    check("one frame reversed is the same", samples_after(DEMO, slot, "reverse", "--from", "5", "--to", "6") == before)
    edited = samples_after(DEMO, slot, "fade-in", "--from", "0", "--to", str(frames // 2))[first["index"]]
    check("fade-in changes the data, not the format", edited["crc32"] != first["crc32"]
          and edited["length"] == first["length"] and edited["bits"] == first["bits"], edited)
    os.remove(out)
    empty_slot = str(next(i for i in range(1, 129) if i not in before))
    refusals = [
        ((DEMO, slot, "sharpen"), 2, "unknown operation"),
        ((DEMO, empty_slot, "reverse"), 1, "holds no sound"),
        ((DEMO, slot, "reverse", "--from", "0", "--to", str(frames + 1)), 2, "not inside"),
        ((DEMO, slot, "reverse", "--from", "9", "--to", "9"), 2, "not inside"),
        ((DEMO, slot, "reverse", "--from", "-3"), 2, "frame number"),
        ((DEMO, "129", "reverse"), 2, "SLOT"),
        ((os.path.join(tmp, "missing.otm"), slot, "reverse"), 1, "missing.otm"),
    ]
    for args, status, words in refusals:
        r = run("edit-sound", *args, "-o", out)
        check(f"edit-sound {args} refused", r.returncode == status and r.stderr.count("\n") == 1
              and words in r.stderr and not os.path.exists(out), (r.returncode, r.stderr))
    check("edit-sound help", run("edit-sound", "--help").returncode == 0)

# Usage errors exit 2; help exits 0.
# Without a display the desktop program says so in one line and points at the commands.
nodisplay = {k: v for k, v in os.environ.items() if k not in ("DISPLAY", "WAYLAND_DISPLAY")}
r = subprocess.run([ONDREL], capture_output=True, text=True, timeout=60, env=nodisplay)
check("no display: exit 2", r.returncode == 2, r.returncode)
check("no display: one line naming play and render", r.stderr.count("\n") == 1 and "render" in r.stderr, r.stderr)
check("unknown command", run("frobnicate").returncode == 2)
check("info without file", run("info").returncode == 2)
check("unknown option", run("info", "--bogus", DEMO).returncode == 2)
check("help", run("--help").returncode == 0 and "info" in run("--help").stdout)
check("info help", run("info", "--help").returncode == 0)

if failures:
    print("\n".join(failures))
    print(f"0 passed, {len(failures)} failed")
    sys.exit(1)
print("cli checks passed")
