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
    rows = [line.split() for line in open(path)]
    return [(int(w[0]), dict(x.split("=", 1) for x in w[1:])) for w in rows if w and w[0].isdigit()]


def matches(want, got):
    return want == "x" or (got in "zx" if want == "z" else want == got)


ref, net = read(sys.argv[1]), read(sys.argv[2])
if not ref or len(net) != len(ref):
    sys.exit(f"the reference printed {len(ref)} cycles, the netlist {len(net)}")
bad_cycles = 0
for (cycle, want), (_, got) in zip(ref, net):
    bad = [f"{name}: {bits} vs {got.get(name)}" for name, bits in want.items()
           if len(got.get(name, "")) != len(bits)
           or not all(matches(w, g) for w, g in zip(bits.lower(), got[name].lower()))]
    if bad and bad_cycles < 5:
        print(f"cycle {cycle}: " + "; ".join(bad))
    bad_cycles += bool(bad)
print(f"{len(ref)} cycles, {bad_cycles} with mismatches")
sys.exit(1 if bad_cycles else 0)
