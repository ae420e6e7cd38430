#!/usr/bin/env python3
"""The ondrel command line end to end: exit codes, messages and the JSON report."""
import json
import os
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


SONG_KEYS = {"name", "tempo", "speed", "nbpos", "repeat", "nbtrack", "format", "globalvol",
             "sequence", "trackpan", "trackpan2", "trackvol", "trackc", "tracke", "nbvoice",
             "trackword1", "rows", "patterns", "samples", "efx"}
SAMPLE_KEYS = {"index", "name", "rate", "length", "loopstart", "loopend", "loopon", "refnote",
               "volume", "bits", "stereo", "framecode", "finetune", "level", "setting",
               "flagword", "envelope", "crc32"}

# The demo song, as scripts see it.
demo = json_report(DEMO)
check("song keys", set(demo) == SONG_KEYS, sorted(set(demo) ^ SONG_KEYS))
check("demo name", demo["name"] == "Ondrel Morning", demo["name"])
check("sequence length", len(demo["sequence"]) == demo["nbpos"])
for key in ("trackpan", "trackpan2", "trackvol", "trackc", "tracke", "nbvoice", "trackword1"):
    check(f"{key} entries", len(demo[key]) == 64, len(demo[key]))
check("rows entries", len(demo["rows"]) == 128)
check("efx keys", set(demo["efx"]) == {"echolen", "echolevel", "echoon", "efxflag", "efxa", "efxb", "efxc"})
check("patterns", [p["index"] for p in demo["patterns"]] == [0, 1, 2, 3])
for p in demo["patterns"]:
    check("pattern keys", set(p) == {"index", "rows", "tracks", "cells"}, p.keys())
    for cell in p["cells"]:
        row, track = cell[0], cell[1]
        check("cell in pattern", 0 <= row < p["rows"] and 0 <= track < p["tracks"], cell)
        check("cell not empty", any(cell[2:]), cell)
check("samples", len(demo["samples"]) == 6)
for s in demo["samples"]:
    check("sample keys", set(s) == SAMPLE_KEYS, sorted(set(s) ^ SAMPLE_KEYS))
    check("sample index 1-based", 1 <= s["index"] <= 127)
    check("envelope words", len(s["envelope"]) == 25)
    check("crc of data", s["crc32"] != 0 or s["length"] == 0, s)

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

# Usage errors exit 2; help exits 0.
check("no command", run().returncode == 2)
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
