#!/usr/bin/env python3
"""The installation's cell library (SHARE/verilog/src) against its data files
(SHARE/data).

usage: cells.py check SHARE WORK
         Every cell of cells.dat has both models and simprops.dat names no
         other cell. Each model compiles with Icarus Verilog (a timcell with
         chipwide.v), together with the models its RecursiveInclusion entry
         names, connected pin by pin as cells.dat declares them; it declares
         exactly the parameters of simprops.dat, in that order (the funcells
         without the timing-check switches XON and MSGON), whose values read
         back, to the bit, the defaults simprops.dat gives. Its ports as yosys
         reads them match cells.dat (names, order, directions, ranges; a
         big-ending cell's buses run from index 0 up; the timcell of an input
         pad reads its pad pin). Verilator lints all timcells in one design
         without a warning; yosys reads them, and finds no problem in the
         funcells.
       cells.py compare SHARE WORK
         One bench instantiates every cell (but the pads, which have no
         behaviour, and V_DCM, whose funcell only passes its clock through)
         twice, with random parameter values and their complements, and
         drives it at random: clock pins from one clock (C1 from its inverse,
         as a dual-rate flop expects), reset-like pins active in about one
         cycle in eight (a preset never as a clear ends), IB as the complement
         of I, inout pins weakly. Simulated with the timcells (with their
         table primitives, and with the plain bodies of CELLS_NO_UDP) and with
         the funcells, the outputs agree bit for bit in every half-cycle after
         the first 20 cycles (the timcells' global set/reset holds the flops
         for 100 ns, and the funcells' flops meet an inverted clock's edge at
         time 0).
       cells.py models SHARE DESIGN.json
         Lists the timcells the design instantiates, each once, the models
         its RecursiveInclusion entry names before a cell.
Prints one line per failure and exits 1 when there is any.
"""
import json
import os
import random
import re
import subprocess
import sys

SWITCHES = {"XON", "MSGON"}
FORMATS = {"HV": "%b", "BV": "%b", "I": "%0d", "F": "%f", "S": "%0s", "BL": "%0s"}
failures = []


def fail(text):
    failures.append(text)
    print("FAIL: " + (text if len(text) < 2000 else text[:2000] + " ..."))


def words(path):
    for line in open(path):
        if line.split("#", 1)[0].split():
            yield line.split("#", 1)[0].split()


class Lib:
    """cells: name -> [(pin, direction, (msb, lsb) or None, pad)] in port
    order; props: name -> [(parameter, type, default)]; deps: NAME -> the
    models to read before it; bigend: NAME -> bus names, None for all."""

    def __init__(self, share):
        self.src = os.path.join(share, "verilog", "src")
        data = os.path.join(share, "data")
        self.cells, self.pads, self.props, keys = {}, set(), {}, {}
        for w in words(os.path.join(data, "cells.dat")):
            if w[0] == "cell":
                pins = self.cells[w[1]] = []
                if w[-1] == "pad":
                    self.pads.add(w[1])
            else:
                rng = (int(w[3]), int(w[4])) if w[0] == "bus" else None
                pins.append((w[1], w[2], rng, w[-1] == "pad"))
        for cell, name, ptype, default in words(os.path.join(data, "simprops.dat")):
            self.props.setdefault(cell, []).append((name, ptype.upper(), default))
        for line in open(os.path.join(data, "vdm2ver.acd")):
            key, _, items = line.split("#", 1)[0].partition("=")
            keys.setdefault(key.strip(), []).extend(filter(None, map(str.strip, items.split(","))))
        self.deps, self.bigend = {}, {}
        for item in keys.get("RecursiveInclusion", []):
            self.deps.setdefault(item.split(":")[0].upper(), []).extend(item.split(":")[1:])
        for item in keys.get("BigEndingTimcell", []):
            buses = {b.upper() for b in item.split(":")[1:]}
            self.bigend[item.split(":")[0].upper()] = buses or None

    def model(self, library, name):
        return os.path.join(self.src, library, name + ".v")

    def with_deps(self, names):
        out = []
        for name in names:
            out += [m for m in self.deps.get(name.upper(), []) + [name] if m not in out]
        return out


def run(cmd, work, ok=None):
    r = subprocess.run(cmd, cwd=work, capture_output=True, text=True)
    text = (r.stdout + r.stderr).strip()
    if r.returncode != 0 or (ok and not ok(text)):
        fail(f"{' '.join(cmd[:3])} ...: {text}")
    return r.stdout


def instance(cell, pins, inst):
    decls = [f"wire {f'[{p[2][0]}:{p[2][1]}] ' if p[2] else ''}{inst}_{p[0]};" for p in pins]
    conns = ", ".join(f".{p[0]}({inst}_{p[0]})" for p in pins)
    return decls + [f"{cell} {inst} ({conns});"]


def expected_value(ptype, default):
    if ptype in ("HV", "BV"):
        width, digits = default.split("'", 1)
        return format(int(digits[1:], 16 if ptype == "HV" else 2), f"0{width}b")
    return str(int(default)) if ptype == "I" else "%f" % float(default) if ptype == "F" \
        else default.strip('"')


def check_parameters(lib, library, cell, work):
    """Compiles one model with what it needs, reads its parameters back."""
    table = [p for p in lib.props.get(cell, []) if library == "timcells" or p[0] not in SWITCHES]
    text = open(lib.model(library, cell)).read()
    declared = re.findall(r"\bparameter\s+(?:real\s+|integer\s+)?(?:\[[^\]]*\]\s*)?(\w+)\s*=",
                          re.sub(r"//.*", "", text))
    if declared != [n for n, _, _ in table]:
        fail(f"{cell}: {library} parameters {declared}, simprops.dat {[n for n, _, _ in table]}")
    shows = [f'$display("{n}={FORMATS[t]}", u.{n});' for n, t, _ in table]
    top = os.path.join(work, f"{library}_{cell}.v")
    with open(top, "w") as f:
        f.write("\n".join(["`timescale 1 ns/1 ps", "module check_top;"]
                          + instance(cell, lib.cells[cell], "u") + ["initial begin"] + shows
                          + ["$finish;", "end", "endmodule", ""]))
    chipwide = [os.path.join(lib.src, "chipwide.v"), "-s", "chipwide"] * (library == "timcells")
    exe = top + "vp"
    before = len(failures)
    run(["iverilog", "-g2005", "-gspecify", "-o", exe, "-s", "check_top", top] + chipwide
        + [lib.model(library, m) for m in lib.with_deps([cell])], work, lambda t: not t)
    if len(failures) > before:
        return
    got = dict(ln.split("=", 1) for ln in run(["vvp", "-n", exe], work).splitlines() if "=" in ln)
    for name, ptype, default in table:
        if got.get(name, "").strip() != expected_value(ptype, default):
            fail(f"{cell}: {library} parameter {name} is {got.get(name)!r}, simprops.dat {default}")


def check_ports(lib, library, modules):
    for cell, pins in lib.cells.items():
        want, ports = [], modules.get(cell, {}).get("ports", {})
        for name, direction, rng, pad in pins:
            big = lib.bigend.get(cell.upper(), False)
            if rng and (big is None or big and name.upper() in big):
                rng = (min(rng), max(rng))
            if library == "timcells" and pad and direction == "output":
                direction = "input"  # an input pad's model reads its pad pin (see V_IPAD)
            want.append((name, direction, rng))
        got = []
        for name, p in ports.items():
            width, low = len(p["bits"]), p.get("offset", 0)
            rng = (low, low + width - 1) if p.get("upto") else (low + width - 1, low)
            got.append((name, p["direction"], None if rng == (0, 0) else rng))
        if got != want:
            fail(f"{cell}: {library} ports {got}, cells.dat {want}")


def check(lib, work):
    for unknown in sorted(set(lib.props) - set(lib.cells)):
        fail(f"simprops.dat names {unknown}, which cells.dat does not list")
    for library in ("timcells", "funcells"):
        for cell in lib.cells:
            if not os.path.isfile(lib.model(library, cell)):
                fail(f"{cell}: no {library} model")
    if failures:
        return
    for library in ("timcells", "funcells"):
        for cell in lib.cells:
            check_parameters(lib, library, cell, work)
    tim = [lib.model("timcells", c) for c in lib.cells]
    fun = [lib.model("funcells", c) for c in lib.cells]
    lines = ["`timescale 1 ns/1 ps", "module lint_top;", "chipwide chipwide ();"]
    for i, cell in enumerate(lib.cells):
        lines += instance(cell, lib.cells[cell], f"u{i}")
    with open(os.path.join(work, "lint_top.v"), "w") as f:
        f.write("\n".join(lines + ["endmodule", ""]))
    chipwide = os.path.join(lib.src, "chipwide.v")
    run(["verilator", "--lint-only", "--timing", "--top-module", "lint_top", chipwide, "lint_top.v"]
        + tim, work, lambda t: "%Warning" not in t)
    # yosys reads the timcells (their ports from a second reading as black
    # boxes) and checks the funcells.
    for library, files, steps in (
            ("timcells", [chipwide] + tim, "design -reset; read_verilog -lib " + " ".join(tim)),
            ("funcells", fun, "hierarchy; proc; check -assert")):
        out = os.path.join(work, library + ".json")
        run(["yosys", "-q", "-p", f"read_verilog {' '.join(files)}; {steps}; write_json {out}"],
            work)
        if os.path.isfile(out):
            check_ports(lib, library, json.load(open(out))["modules"])
    print(f"cell library: {len(lib.cells)} cells, {len(failures)} failure(s)")


CLOCKS, INVERTED_CLOCKS, RARE = {"C", "C0", "CLK"}, {"C1"}, {"CLR", "PRE", "R", "S", "RST"}
CYCLES, SETTLE = 200, 20


def bench(lib, used):
    lines = ["`timescale 1 ns/1 ps", "module models_tb;", "reg clk;", "reg [31:0] r0, r1, r2;",
             "integer seed, cycle;"]
    shown, body, bits = [], [], iter(range(1 << 30))

    def pick():
        n = next(bits)
        return f"r{n % 3}[{n % 32}]"

    for cell, copy in [(c, k) for c in used for k in (0, 1)]:
        inst, conns, params = f"u{copy}_{cell}", [], []
        for name, ptype, default in lib.props.get(cell, []):
            if ptype in ("HV", "BV"):  # both values of a flop's INIT, every table bit both ways
                width = int(default.split("'", 1)[0])
                value = random.Random(f"{cell}.{name}").getrandbits(width)
                params.append(f".{name}({width}'h{value ^ (copy * ((1 << width) - 1)):x})")
        for name, direction, rng, _ in lib.cells[cell]:
            net, width = f"{inst}_{name}", abs(rng[0] - rng[1]) + 1 if rng else 1
            decl = f"wire [{width - 1}:0] {net};" if rng else f"wire {net};"
            tie = {**dict.fromkeys(CLOCKS, "clk"), **dict.fromkeys(INVERTED_CLOCKS, "~clk"),
                   "IB": f"~{inst}_I"}.get(name) if direction == "input" else None
            if tie:
                conns.append(f".{name}({tie})")
                continue
            lines.append(decl)
            if direction == "output":
                shown.append(net)
            elif direction == "inout":
                drive = ", ".join(pick() for _ in range(width))
                body.append(f"assign (weak1, weak0) {net} = {{{drive}}};")
                shown.append(net)
            else:
                one = [f"({pick()} & {pick()} & {pick()})" if name in RARE else pick()
                       for _ in range(width)]
                value = "{" + ", ".join(one) + "}"
                if name == "PRE" and any(p[0] == "CLR" for p in lib.cells[cell]):
                    # Event-driven simulation of the funcell misses a preset
                    # that is still active when the clear ends.
                    value += f" & ~{inst}_CLR"
                body.append(f"assign {net} = {value};")
            conns.append(f".{name}({net})")
        params = f" #({', '.join(params)})" if params else ""
        body.append(f"{cell}{params} {inst} ({', '.join(conns)});")
    show = (f'$display("%0d.%0d {" ".join(n + "=%b" for n in shown)}", cycle, half, '
            f'{", ".join(shown)});')
    lines += body + ["integer half;", "initial begin", "clk = 0; r0 = 0; r1 = 0; r2 = 0; seed = 7;",
                     "#100;",
                     f"for (cycle = 0; cycle < {CYCLES}; cycle = cycle + 1)",
                     "for (half = 0; half < 10; half = half + 5) begin",
                     "#5 r0 = $random(seed); r1 = $random(seed); r2 = $random(seed);",
                     "#4 " + show, "#1 clk = !clk;", "end", "$finish;", "end", "endmodule", ""]
    return "\n".join(lines)


def simulate(lib, work, library, *defines):
    exe = os.path.join(work, library + "".join(defines) + ".vvp")
    roots = ["-s", "chipwide", os.path.join(lib.src, "chipwide.v")] if library == "timcells" else []
    used = [c for c in lib.cells if c not in lib.pads and c != "V_DCM"]
    run(["iverilog", "-g2005", "-o", exe, "-s", "models_tb"] + [f"-D{d}" for d in defines] + roots
        + ["models_tb.v"] + [lib.model(library, m) for m in lib.with_deps(used)], work)
    lines = [ln.split() for ln in run(["vvp", "-n", exe], work).splitlines() if ln[:1].isdigit()]
    if len(lines) != 2 * CYCLES:
        fail(f"{library} {' '.join(defines)}: {len(lines)} lines printed, {2 * CYCLES} expected")
    return lines


def compare(lib, work):
    used = [c for c in lib.cells if c not in lib.pads and c != "V_DCM"]
    with open(os.path.join(work, "models_tb.v"), "w") as f:
        f.write(bench(lib, used))
    fun = simulate(lib, work, "funcells")
    differ = {}
    for tim in (simulate(lib, work, "timcells"), simulate(lib, work, "timcells", "CELLS_NO_UDP")):
        for a, b in zip(tim, fun):
            for x, y in zip(a[1:], b[1:]) if float(a[0]) >= SETTLE else ():
                if x != y:
                    differ.setdefault(x.split("=")[0], f"at {a[0]}: timcell {x}, funcell {y}")
    for net, text in sorted(differ.items()):
        fail(f"{net} {text}")
    print(f"models: {len(used)} cells, {len(failures)} failure(s)")


def models(lib, design):
    used = [c["type"] for m in json.load(open(design))["modules"].values()
            if not m.get("attributes", {}).get("blackbox") for c in m["cells"].values()]
    for name in lib.with_deps([c for c in dict.fromkeys(used) if c in lib.cells]):
        print(lib.model("timcells", name))


if __name__ == "__main__":
    what, share, where = sys.argv[1:4]
    if what != "models":
        os.makedirs(where, exist_ok=True)
        where = os.path.abspath(where)
    {"check": check, "compare": compare, "models": models}[what](Lib(os.path.abspath(share)), where)
    sys.exit(1 if failures else 0)
