#!/usr/bin/env python3
"""Compares the per-cycle output lines of two simulations of one bench.

usage: compare_sim.py REFERENCE.log NETLIST.log

Lines are "CYCLE name=bits name=bits ...". A reference bit that is x (a
register the RTL leaves uninitialized) matches any netlist bit, and one that
is z (a floating net) matches z or x (buffers turn a floating input into an
unknown); every other bit must be equal. Prints the first mismatches and
a one-line summary; exits 1 on any mismatch or when the netlist simulation
printed fewer cycles.
"""

import sys


def read(path):
    rows = []
    with open(path) as f:
        for line in f:
            words = line.split()
            if words and words[0].isdigit():
                rows.append((int(words[0]), dict(w.split("=", 1) for w in words[1:])))
    return rows


def matches(want, got):
    want, got = want.lower(), got.lower()
    if want == "x":
        return True
    if want == "z":
        return got in "zx"
    return want == got


def main():
    ref, net = read(sys.argv[1]), read(sys.argv[2])
    shown = 0
    bad_cycles = 0
    if not ref:
        print("no cycles in the reference simulation")
        return 1
    if len(net) != len(ref):
        print(f"the reference printed {len(ref)} cycles, the netlist {len(net)}")
        return 1
    for (cycle, want), (_, got) in zip(ref, net):
        bad = []
        for name, bits in want.items():
            other = got.get(name)
            if other is None or len(other) != len(bits):
                bad.append(f"{name}: {bits} vs {other}")
                continue
            if any(not matches(w, g) for w, g in zip(bits, other)):
                bad.append(f"{name}: {bits} vs {other}")
        if bad:
            bad_cycles += 1
            if shown < 5:
                print(f"cycle {cycle}: " + "; ".join(bad))
                shown += 1
    print(f"{len(ref)} cycles, {bad_cycles} with mismatches")
    return 1 if bad_cycles else 0


if __name__ == "__main__":
    sys.exit(main())
