#!/usr/bin/env python3
"""Simulates every cell's timing model against its functional model.

usage: compare_models.py SHARE_DIR WORK_DIR

One bench instantiates every cell of cells.dat (except the pads, which
have no behaviour, and V_DCM, whose functional model only passes its clock
through) with random parameter values and random inputs, and is simulated
with Icarus Verilog: with the timcells and the chipwide module (once with
their table primitives, once with the plain bodies of CELLS_NO_UDP), and
with the funcells. Clock pins run from one clock (C1 from its inverse, as a
dual-rate flop expects); reset-like pins are active in about one cycle in
eight (a preset never together with a clear); IB of a differential buffer
is the complement of I; inout pins are driven weakly. The outputs must be identical, bit for bit, in every
half-cycle after the first 20 cycles (the global set/reset of the timcells
holds the flops for the first 100 ns, and the functional flops meet an
edge of the inverted clock at time 0).
"""

import os
import random
import subprocess
import sys

# No bytecode cache in the source tree.
sys.dont_write_bytecode = True
sys.path.insert(0, os.path.dirname(os.path.abspath(__file__)))
from installation import Installation, recursive_inclusions  # noqa: E402

SKIP = {"V_DCM"}
CLOCKS = {"C", "C0", "CLK"}
INVERTED_CLOCKS = {"C1"}
RARE = {"CLR", "PRE", "R", "S", "RST"}
CYCLES = 200
SETTLE = 20


def literal(ptype, default, draw, copy):
    """A random value, its complement in the second copy of a cell (both
    values of a flop's INIT, every bit of a table both ways)."""
    if ptype in ("HV", "BV"):
        width = int(default.split("'", 1)[0])
        value = random.Random(draw).getrandbits(width)
        return f"{width}'h{value ^ (copy * ((1 << width) - 1)):x}"
    return None


def bench(inst):
    lines = ["`timescale 1 ns/1 ps", "module models_tb;", "  reg clk;", "  reg [31:0] r0, r1, r2;",
             "  integer seed, cycle;"]
    shown = []
    bit = 0

    def random_bit():
        nonlocal bit
        bit += 1
        return bit - 1

    body = []
    for cell, copy in [(c, k) for c in inst.cells for k in (0, 1)]:
        if cell.pad or cell.name in SKIP:
            continue
        inst_name = f"u{copy}_{cell.name}"
        params = []
        for name, ptype, default in inst.simprops.get(cell.name, []):
            value = literal(ptype, default, f"{cell.name}.{name}", copy)
            if value is not None:
                params.append(f".{name}({value})")
        conns = []
        for pin in cell.pins:
            net = f"{inst_name}_{pin.name}"
            decl = f"[{pin.width - 1}:0] " if pin.is_bus else ""
            if pin.direction == "output":
                lines.append(f"  wire {decl}{net};")
                shown.append(net)
            elif pin.direction == "inout":
                lines.append(f"  wire {decl}{net};")
                drive = ", ".join(f"r{random_bit() % 3}[{bit % 32}]" for _ in range(pin.width))
                body.append(f"  assign (weak1, weak0) {net} = {{{drive}}};")
                shown.append(net)
            elif pin.name in CLOCKS:
                conns.append(f".{pin.name}(clk)")
                continue
            elif pin.name in INVERTED_CLOCKS:
                conns.append(f".{pin.name}(~clk)")
                continue
            elif pin.name == "IB":
                conns.append(f".IB(~{inst_name}_I)")
                continue
            else:
                lines.append(f"  wire {decl}{net};")
                picks = []
                for _ in range(pin.width):
                    a, b, c = (random_bit() for _ in range(3))
                    one = f"r{a % 3}[{a % 32}]"
                    if pin.name in RARE:
                        one = f"(r{a % 3}[{a % 32}] & r{b % 3}[{b % 32}] & r{c % 3}[{c % 32}])"
                    picks.append(one)
                value = "{" + ", ".join(picks) + "}"
                if pin.name == "PRE" and any(p.name == "CLR" for p in cell.pins):
                    # Event-driven simulation of the functional model misses
                    # a preset that is still active when the clear ends.
                    value = f"{value} & ~{inst_name}_CLR"
                body.append(f"  assign {net} = {value};")
            conns.append(f".{pin.name}({net})")
        param_text = f" #({', '.join(params)})" if params else ""
        body.append(f"  {cell.name}{param_text} {inst_name} ({', '.join(conns)});")
    lines += body
    lines += [
        "  initial begin",
        "    clk = 1'b0;",
        "    r0 = 0;",
        "    r1 = 0;",
        "    r2 = 0;",
        "    seed = 7;",
        "    #100;",
        f"    for (cycle = 0; cycle < {CYCLES}; cycle = cycle + 1) begin",
        "      #5 r0 = $random(seed); r1 = $random(seed); r2 = $random(seed);",
        f'      #4 $display("%0d.0 {" ".join(n + "=%b" for n in shown)}", cycle, '
        + ", ".join(shown) + ");",
        "      #1 clk = 1'b1;",
        "      #5 r0 = $random(seed); r1 = $random(seed); r2 = $random(seed);",
        f'      #4 $display("%0d.5 {" ".join(n + "=%b" for n in shown)}", cycle, '
        + ", ".join(shown) + ");",
        "      #1 clk = 1'b0;",
        "    end",
        "    $finish;",
        "  end",
        "endmodule",
    ]
    return "\n".join(lines) + "\n"


def simulate(files, roots, exe, work, defines=()):
    cmd = ["iverilog", "-g2005", "-o", exe] + [f"-D{d}" for d in defines]
    for root in roots:
        cmd += ["-s", root]
    r = subprocess.run(cmd + files, cwd=work, capture_output=True, text=True)
    if r.returncode != 0:
        raise RuntimeError((r.stdout + r.stderr).strip())
    r = subprocess.run(["vvp", "-n", exe], cwd=work, capture_output=True, text=True)
    return [line.split() for line in r.stdout.splitlines() if line[:1].isdigit()]


def main():
    share, work = os.path.abspath(sys.argv[1]), os.path.abspath(sys.argv[2])
    os.makedirs(work, exist_ok=True)
    inst = Installation(share)
    deps = recursive_inclusions(inst.acd)
    tb = os.path.join(work, "models_tb.v")
    with open(tb, "w") as f:
        f.write(bench(inst))
    used = [c.name for c in inst.cells if not c.pad and c.name not in SKIP]
    names = []
    for name in used:
        for model in deps.get(name.upper(), []) + [name]:
            if model not in names:
                names.append(model)
    timcells = [tb, os.path.join(inst.src, "chipwide.v")] + [inst.model("timcells", n) for n in names]
    try:
        # The timcells twice: with their table primitives and with the plain
        # bodies that tools without tables read.
        tim = simulate(timcells, ["models_tb", "chipwide"], os.path.join(work, "tim.vvp"), work)
        tim += simulate(timcells, ["models_tb", "chipwide"], os.path.join(work, "plain.vvp"), work,
                        ["CELLS_NO_UDP"])
        fun = 2 * simulate([tb] + [inst.model("funcells", n) for n in names], ["models_tb"],
                           os.path.join(work, "fun.vvp"), work)
    except RuntimeError as e:
        print(f"FAIL: {e}")
        return 1
    if len(tim) != 4 * CYCLES or len(fun) != 4 * CYCLES:
        print(f"FAIL: {len(tim)} and {len(fun)} lines printed, {4 * CYCLES} expected")
        return 1
    differ = {}
    for a, b in zip(tim, fun):
        if float(a[0]) < SETTLE:
            continue
        for x, y in zip(a[1:], b[1:]):
            if x != y:
                differ.setdefault(x.split("=")[0], f"at {a[0]}: timcell {x}, funcell {y}")
    for net, text in sorted(differ.items()):
        print(f"FAIL: {net} {text}")
    print(f"models: {len(used)} cells, timcells and funcells agree"
          if not differ else f"models: {len(differ)} outputs differ")
    return 1 if differ else 0


if __name__ == "__main__":
    sys.exit(main())
