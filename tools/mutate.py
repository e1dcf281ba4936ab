#!/usr/bin/env python3
"""Mutation run: how many small faults in s/ and host/ do the tests catch?

Picks a fixed, seeded sample of small mutations of the library and host
sources (a flipped comparison, a constant changed by one, a dropped
statement, two swapped arguments), and for each one rebuilds and runs the
unit and end-to-end tests. A mutation is caught when any test fails (or the
run times out); one that does not compile is counted apart. The sources are
restored after every mutation, also when the run is interrupted. Each
catch names the tests that failed; --only runs chosen sites of the sample
again (a catch by an unrelated test may be a test that fails by chance).

    tools/mutate.py [--seed N] [--count N] [--build DIR] [--tests REGEX] [--list]
                    [--only FILE:LINE,...]

Run it in a worktree of its own: it edits the sources it mutates in place.
The sample depends only on the seed and the source text, so two runs over
the same sources with different tests compare their fault-finding power; a
site that a change of the code leaves alone stays in the sample.
"""
import argparse
import os
import hashlib
import re
import subprocess
import sys
import time

ROOT = os.path.dirname(os.path.dirname(os.path.abspath(__file__)))

COMPARISONS = [(" == ", " != "), (" != ", " == "), (" < ", " >= "), (" >= ", " < "),
               (" > ", " <= "), (" <= ", " > "), (" && ", " || "), (" || ", " && ")]
NUMBER = re.compile(r"(?<![\w.])(\d+)(?![\w.])")
STATEMENT = re.compile(r"^\s+(?:\+\+|--)?[A-Za-z_][\w:.\->\[\]]*\s*(?:\(.*\)|\+\+|--|[+\-|&]?=[^=].*);\s*$")
TWO_ARGS = re.compile(r"\b([A-Za-z_]\w*)\(([A-Za-z_][\w.\->]*), ([A-Za-z_][\w.\->]*)\)")


def sources():
    files = []
    for top in ("s", "host"):
        for dirpath, _, names in os.walk(os.path.join(ROOT, top)):
            files += [os.path.join(dirpath, n) for n in names if n.endswith(".cpp")]
    return sorted(files)


def candidates(path):
    """Every mutation site of a file: (line index, kind, old line, new line)."""
    out = []
    with open(path, encoding="utf-8") as f:
        lines = f.read().split("\n")
    in_comment = False
    for i, line in enumerate(lines):
        text = line.strip()
        if in_comment:
            in_comment = "*/" not in text
            continue
        if text.startswith("/*"):
            in_comment = "*/" not in text
            continue
        if not text or text.startswith(("//", "#")) or '"' in line or "'" in line:
            continue
        code = line.split("//")[0]
        for old, new in COMPARISONS:
            if old in code and "template" not in code and "<<" not in code:
                out.append((i, "comparison", line, code.replace(old, new, 1)))
        m = NUMBER.search(code)
        if m and not code.lstrip().startswith(("case ", "enum")):
            value = int(m.group(1))
            out.append((i, "constant", line, code[:m.start()] + str(value + 1) + code[m.end():]))
        if STATEMENT.match(code) and not text.startswith(("return", "else", "break", "continue")):
            out.append((i, "drop", line, ""))
        m = TWO_ARGS.search(code)
        if m and m.group(2) != m.group(3):
            swapped = "%s(%s, %s)" % (m.group(1), m.group(3), m.group(2))
            out.append((i, "swap", line, code[:m.start()] + swapped + code[m.end():]))
    return out


def sample(seed, count):
    sites = []
    for path in sources():
        for i, kind, old, new in candidates(path):
            sites.append((os.path.relpath(path, ROOT), i, kind, old, new))
    # Each site's rank is a seeded hash of its file, text and kind, not of its
    # position: a site that an unrelated change leaves alone keeps its rank,
    # so samples of two versions of the code share their unchanged sites.
    # Twice the count: mutations that do not compile are replaced by the next.
    def rank(site):
        path, _, kind, old, new = site
        key = "%d|%s|%s|%s|%s" % (seed, path, kind, old.strip(), new.strip())
        return hashlib.sha256(key.encode()).hexdigest()
    sites.sort(key=rank)
    return sites[:count * 2], len(sites)


def run(cmd, cwd, timeout, failed=None):
    """The command's exit code, or "timeout"; the names of the tests ctest
    reports failed are added to the list failed."""
    try:
        p = subprocess.run(cmd, cwd=cwd, stdout=subprocess.PIPE, stderr=subprocess.STDOUT,
                           timeout=timeout)
        if failed is not None:
            failed += re.findall(r"Test +#\d+: (\S+) \.*\**(?:Failed|Exception|Timeout)",
                                 p.stdout.decode(errors="replace"))
        return p.returncode
    except subprocess.TimeoutExpired:
        return "timeout"


def main():
    ap = argparse.ArgumentParser(description=__doc__.split("\n")[0])
    ap.add_argument("--seed", type=int, default=15)
    ap.add_argument("--count", type=int, default=60)
    ap.add_argument("--build", default=os.path.join(ROOT, "build-mutate"))
    ap.add_argument("--tests", default="", help="ctest -R regex (default: all tests)")
    ap.add_argument("--jobs", type=int, default=2)
    ap.add_argument("--list", action="store_true", help="print the sample and stop")
    ap.add_argument("--only", default="",
                    help="comma-separated FILE:LINE sites of the sample to run again")
    args = ap.parse_args()

    chosen, total = sample(args.seed, args.count)
    if args.only:
        only = set(args.only.split(","))
        chosen = [c for c in chosen if "%s:%d" % (c[0], c[1] + 1) in only]
    if args.list:
        for path, i, kind, old, new in chosen[:args.count]:
            print("%s:%d %s\n  - %s\n  + %s" % (path, i + 1, kind, old.strip(), new.strip()))
        return 0

    if not os.path.exists(os.path.join(args.build, "CMakeCache.txt")):
        subprocess.check_call(["cmake", "-S", ROOT, "-B", args.build, "-DCMAKE_BUILD_TYPE=Release",
                               "-DNLW_TESTS=ON"], stdout=subprocess.DEVNULL)
    if run(["cmake", "--build", args.build, "-j%d" % args.jobs], ROOT, 3600) != 0:
        print("the unmutated tree does not build", file=sys.stderr)
        return 2
    ctest = ["ctest", "--stop-on-failure", "-j%d" % args.jobs, "--timeout", "300"]
    if args.tests:
        ctest += ["-R", args.tests]
    if run(ctest, args.build, 3600) != 0:
        print("the unmutated tree fails its tests", file=sys.stderr)
        return 2

    caught = survived = invalid = 0
    survivors = []
    for path, i, kind, old, new in chosen:
        if caught + survived >= args.count:
            break
        full = os.path.join(ROOT, path)
        with open(full, encoding="utf-8") as f:
            original = f.read()
        lines = original.split("\n")
        assert lines[i] == old, "%s changed since the sample was taken" % path
        lines[i] = new
        start = time.time()
        kind_note = ""
        try:
            with open(full, "w", encoding="utf-8") as f:
                f.write("\n".join(lines))
            if run(["cmake", "--build", args.build, "-j%d" % args.jobs], ROOT, 1800) != 0:
                invalid += 1
                verdict = "invalid"
            else:
                failed = []
                result = run(ctest, args.build, 3600, failed)
                if result == 0:
                    survived += 1
                    survivors.append("%s:%d %s: %s" % (path, i + 1, kind, new.strip() or "(dropped) " + old.strip()))
                    verdict = "SURVIVED"
                else:
                    caught += 1
                    # The test that failed: a catch by a test that has
                    # nothing to do with the site is worth a second look.
                    verdict = "caught"
                    kind_note = " by " + ", ".join(failed) if failed else " (%s)" % result
        finally:
            with open(full, "w", encoding="utf-8") as f:
                f.write(original)
        print("%-8s %s:%d %s (%.0f s)%s" % (verdict, path, i + 1, kind, time.time() - start,
                                             kind_note), flush=True)
    run(["cmake", "--build", args.build, "-j%d" % args.jobs], ROOT, 3600)
    print("\nsites: %d, sampled: %d, not compilable: %d" % (total, caught + survived, invalid))
    for s in survivors:
        print("survivor: " + s)
    print("caught %d of %d mutations (%.0f%%)" % (caught, caught + survived,
                                                   100.0 * caught / max(1, caught + survived)))
    return 0


if __name__ == "__main__":
    sys.exit(main())
