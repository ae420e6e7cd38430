#!/usr/bin/env python3
"""Mutation testing: applies each single-point fault of tests/mutation/mutations.txt to the
sources, rebuilds what changed in its own build tree, runs the test suite, and reports
whether the suite noticed (killed), did not (survived), or the fault did not build. The
source file is always restored, on Ctrl+C too.

    scripts/mutate.py [--only NAME,...] [--kill-list FILE] [--baseline FILE]
"""
import argparse
import os
import re
import shutil
import signal
import subprocess
import sys
import time
from pathlib import Path

ROOT = Path(__file__).resolve().parent.parent


def parse_mutations(path):
    mutations = []
    for block in re.split(r"\n\s*\n", path.read_text()):
        fields = {}
        for line in block.splitlines():
            if line.startswith("#") or not line.strip():
                continue
            key, sep, value = line.partition(": ")
            if not sep or key not in ("name", "file", "what", "old", "new"):
                sys.exit(f"mutate: {path}: cannot read line {line!r}")
            fields[key] = value
        if not fields:
            continue
        missing = {"name", "file", "what", "old", "new"} - fields.keys()
        if missing:
            sys.exit(f"mutate: {path}: mutation {fields.get('name', '?')} lacks {', '.join(sorted(missing))}")
        mutations.append(fields)
    names = [m["name"] for m in mutations]
    if len(set(names)) != len(names):
        sys.exit(f"mutate: {path}: names repeat")
    return mutations


def run(cmd, cwd, timeout=None):
    return subprocess.run(cmd, cwd=cwd, stdout=subprocess.PIPE, stderr=subprocess.STDOUT, text=True,
                          timeout=timeout)


def configure(build):
    # No debug information and a quick linker: each mutation relinks every test program.
    options = ["-DCMAKE_BUILD_TYPE=Release", "-DONDREL_TESTS=ON", "-DONDREL_BENCH=OFF",
               "-DONDREL_WERROR=OFF"]
    if shutil.which("ccache"):
        options.append("-DCMAKE_CXX_COMPILER_LAUNCHER=ccache")
    if shutil.which("ld.lld"):
        options.append("-DCMAKE_EXE_LINKER_FLAGS=-fuse-ld=lld")
    r = run(["cmake", "-S", str(ROOT), "-B", str(build), *options], ROOT)
    if r.returncode:
        sys.exit("mutate: cmake failed:\n" + r.stdout[-3000:])


def build_tree(build, jobs):
    return run(["cmake", "--build", str(build), "-j", str(jobs)], ROOT)


def failed_tests(output):
    # ctest lists failures after "The following tests FAILED:" as "  12 - Name (Failed)";
    # a test that ran out of time is marked, as a loaded machine can cause it too.
    return [name + (" (timeout)" if why == "Timeout" else "")
            for name, why in re.findall(r"^\s*\d+ - (\S+) \(([^)]*)\)", output, re.M)]


def run_suite(build, jobs, timeout):
    # The first failure is enough to call a mutation killed.
    r = run(["ctest", "-j", str(jobs), "--timeout", str(timeout), "--stop-on-failure"], build)
    return r.returncode == 0, failed_tests(r.stdout)


def main():
    parser = argparse.ArgumentParser(description=__doc__, formatter_class=argparse.RawDescriptionHelpFormatter)
    parser.add_argument("--mutations", default=str(ROOT / "tests/mutation/mutations.txt"))
    parser.add_argument("--build-dir", default=str(ROOT / "build-mutation"))
    parser.add_argument("--only", help="comma-separated names to run")
    parser.add_argument("--jobs", type=int, default=os.cpu_count() or 2)
    parser.add_argument("--timeout", type=int, default=60, help="seconds per test; longer counts as killed")
    parser.add_argument("--kill-list", help="write 'name result' lines to this file")
    parser.add_argument("--baseline", help="a kill list to compare with: report what it killed and this run did not")
    parser.add_argument("--check", action="store_true", help="only check that every snippet is found once")
    args = parser.parse_args()

    mutations = parse_mutations(Path(args.mutations))
    if args.only:
        wanted = set(args.only.split(","))
        unknown = wanted - {m["name"] for m in mutations}
        if unknown:
            sys.exit(f"mutate: no mutation named {', '.join(sorted(unknown))}")
        mutations = [m for m in mutations if m["name"] in wanted]

    def snippet_count(m):
        path = ROOT / m["file"]
        return path.read_text().count(m["old"]) if path.exists() else 0

    if args.check:
        bad = [(m["name"], snippet_count(m)) for m in mutations if snippet_count(m) != 1]
        for name, n in bad:
            print(f"{name}: snippet found {n} times")
        print(f"{len(mutations)} mutations, {len(bad)} not applicable")
        return 1 if bad else 0

    build = Path(args.build_dir)
    configure(build)
    r = build_tree(build, args.jobs)
    if r.returncode:
        sys.exit("mutate: the unmutated sources do not build:\n" + r.stdout[-3000:])
    ok, failed = run_suite(build, args.jobs, args.timeout)
    if not ok:
        sys.exit(f"mutate: the suite fails without any mutation: {', '.join(failed)}")

    # A kill is handled as Ctrl+C: the file being mutated is restored before leaving.
    def interrupted(*_):
        raise KeyboardInterrupt()

    signal.signal(signal.SIGTERM, interrupted)
    results = []
    width = max(len(m["name"]) for m in mutations)
    print(f"{'mutation':<{width}}  {'result':<12} {'secs':>5}  detail")
    for m in mutations:
        path = ROOT / m["file"]
        start = time.monotonic()
        detail = ""
        if snippet_count(m) != 1:
            result = "stale"
            detail = f"snippet found {snippet_count(m)} times in {m['file']}"
        else:
            original = path.read_text()
            try:
                path.write_text(original.replace(m["old"], m["new"]))
                built = build_tree(build, args.jobs)
                if built.returncode:
                    result = "build-failed"
                    errors = [l for l in built.stdout.splitlines() if "error" in l]
                    detail = errors[0].strip()[:100] if errors else ""
                else:
                    ok, failed = run_suite(build, args.jobs, args.timeout)
                    result = "survived" if ok else "killed"
                    detail = ", ".join(failed[:3]) + (f" (+{len(failed) - 3})" if len(failed) > 3 else "")
            except KeyboardInterrupt:
                path.write_text(original)
                print(f"\nmutate: interrupted; {m['file']} is restored")
                return 130
            finally:
                path.write_text(original)
        results.append((m["name"], result))
        print(f"{m['name']:<{width}}  {result:<12} {time.monotonic() - start:5.0f}  {detail}", flush=True)

    # Leave the tree built from the restored sources.
    build_tree(build, args.jobs)
    counts = {k: sum(1 for _, r in results if r == k) for k in ("killed", "survived", "build-failed", "stale")}
    print(f"{len(results)} mutations: {counts['killed']} killed, {counts['survived']} survived, "
          f"{counts['build-failed']} did not build, {counts['stale']} stale")
    if args.kill_list:
        with open(args.kill_list, "w") as f:
            for name, result in results:
                f.write(f"{name} {result}\n")
    if args.baseline:
        before = dict(line.split() for line in Path(args.baseline).read_text().splitlines() if line.strip())
        lost = [name for name, result in results if before.get(name) == "killed" and result != "killed"]
        gained = [name for name, result in results if before.get(name) == "survived" and result == "killed"]
        print(f"killed before, not now: {' '.join(lost) or 'none'}")
        print(f"killed now, not before: {' '.join(gained) or 'none'}")
        if lost:
            return 1
    return 0


if __name__ == "__main__":
    sys.exit(main())
