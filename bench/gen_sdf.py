#!/usr/bin/env python3
"""Writes the timing file (SDF 3.0, laid out as nextpnr writes one) of the
design gen_design.py N writes, for the timing benchmark.

Every cell gets the entries a place-and-route tool gives its kind: each
lookup table a path from every input, each flip-flop its clock-to-output
path and a setup/hold check; every net inside a block an INTERCONNECT from
its driver to each load, all in the top CELL with full paths. The names are
the design file's own (escaped as SDF wants), so the reader matches every
entry. Delays vary with a fixed seed.

Usage: gen_sdf.py N OUT.sdf
"""

import random
import sys

sys.path.insert(0, __import__("os").path.dirname(__file__))
from gen_design import BLOCKS_PER_MID, CELLS_PER_BLOCK, WIDTH  # noqa: E402


def esc(name):
    return "".join(c if c.isalnum() or c == "_" else "\\" + c for c in name)


def block_cells(w):
    """The cell names of one block by layer, as gen_design.block names them."""
    names = [[f"lut_0_{i}" for i in range(w)],
             [esc(f"$abc$lut${w + i}") for i in range(w)],
             [f"lut_2_{i}" for i in range(w)]]
    regs = [esc(f"state.q[{i}]") for i in range(w)]
    return names, regs


def block_nets(w, luts, regs):
    """(driver cell, pin, load cell, pin) of every net inside a block."""
    nets = []
    for i in range(w):
        nets += [(luts[0][i], "O", luts[1][i], "I0"), (luts[0][i], "O", luts[1][(i - 1) % w], "I1"),
                 (luts[0][i], "O", luts[2][i], "I2"), (luts[1][i], "O", luts[2][i], "I0"),
                 (luts[1][i], "O", luts[2][(i - 1) % w], "I1"),
                 (luts[2][i], "O", regs[(w - 1) - i], "D"), (regs[i], "Q", luts[1][i], "I3"),
                 (regs[i], "Q", luts[2][(i - 1) % w], "I3")]
    return nets


def triple(rng, base):
    v = base + rng.randrange(0, base // 2 + 1)
    return f"({v * 9 // 10}:{v}:{v * 11 // 10})"


def main():
    if len(sys.argv) != 3:
        sys.exit(__doc__)
    n, out = int(sys.argv[1]), sys.argv[2]
    mids = max(1, round(n / (BLOCKS_PER_MID * CELLS_PER_BLOCK)))
    rng = random.Random(1)
    w = WIDTH
    luts, regs = block_cells(w)
    nets = block_nets(w, luts, regs)
    with open(out, "w") as f:
        f.write('(DELAYFILE\n  (SDFVERSION "3.0")\n  (DESIGN "top")\n  (VENDOR "gen_sdf.py")\n'
                '  (PROGRAM "gen_sdf.py")\n  (DIVIDER /)\n  (TIMESCALE 1ps)\n')
        f.write('  (CELL\n    (CELLTYPE "top")\n    (INSTANCE )\n    (DELAY\n      (ABSOLUTE\n')
        for k in range(mids):
            for j in range(BLOCKS_PER_MID):
                p = f"u{k}/u{j}/"
                f.write("".join(
                    f"        (INTERCONNECT {p}{a}/{ap} {p}{b}/{bp} {triple(rng, 300)} "
                    f"{triple(rng, 300)})\n" for a, ap, b, bp in nets))
        f.write("      )\n    )\n  )\n")
        for k in range(mids):
            for j in range(BLOCKS_PER_MID):
                p = f"u{k}/u{j}/"
                parts = []
                for layer in luts:
                    for cell in layer:
                        paths = "".join(
                            f"        (IOPATH I{x} O {triple(rng, 350)} {triple(rng, 350)})\n"
                            for x in range(4))
                        parts.append(f'  (CELL\n    (CELLTYPE "V_LUT4")\n    (INSTANCE {p}{cell})\n'
                                     f"    (DELAY\n      (ABSOLUTE\n{paths}      )\n    )\n  )\n")
                for cell in regs:
                    parts.append(
                        f'  (CELL\n    (CELLTYPE "V_FD")\n    (INSTANCE {p}{cell})\n'
                        f"    (DELAY\n      (ABSOLUTE\n"
                        f"        (IOPATH C Q {triple(rng, 540)} {triple(rng, 540)})\n"
                        f"      )\n    )\n    (TIMINGCHECK\n"
                        f"      (SETUPHOLD (posedge D) (posedge C) {triple(rng, 300)} (0:0:0))\n"
                        f"      (SETUPHOLD (negedge D) (posedge C) {triple(rng, 300)} (0:0:0))\n"
                        f"    )\n  )\n")
                f.write("".join(parts))
        f.write(")\n")
    print(f"{out}: {mids * BLOCKS_PER_MID * CELLS_PER_BLOCK} cells")


if __name__ == "__main__":
    main()
