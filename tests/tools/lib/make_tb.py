#!/usr/bin/env python3
"""Writes a random-stimulus test bench for the top module of a netlist JSON.

usage: make_tb.py DESIGN.json TOP CYCLES SEED [NAME=VALUE...] > tb.v

The bench instantiates TOP as `uut`, connected by port name, with the
parameter values given (for an RTL reference whose netlist was made with
parameter overrides). Clock inputs (one-bit inputs named clk, clock or
clk_*) run with a 20 ns period; every other input takes a new pseudo-random
value 5 ns into each cycle, the same values in every simulation of the same
design. Reset-like inputs (rst, reset, clr, clear, optionally with a suffix;
a final _n or n marks active low) are held active for the first two cycles
and are active in about one cycle in sixteen after that. Inout ports are
driven weakly with random values, so that whatever the design drives wins.
Nothing happens for the first 200 ns, past the global set/reset pulse of the
chipwide module. One line per cycle, printed 1 ns before the rising clock
edge, lists every output and inout in binary.
"""
import json
import random
import re
import sys

PERIOD, START = 20, 200
CLOCK = re.compile(r"^(clk|clock)(_\w+)?$", re.IGNORECASE)
RESET = re.compile(r"^(a?rst|a?reset|clr|clear)(_?n|_\w+)?$", re.IGNORECASE)
ACTIVE_LOW = re.compile(r"(_n|^(a?rst|a?reset|clr|clear)n)$", re.IGNORECASE)


def esc(name):
    return name if re.match(r"^[A-Za-z_][A-Za-z0-9_$]*$", name) else "\\" + name + " "


def declared(p):
    width, low = len(p["bits"]), p.get("offset", 0)
    if width == 1 and "offset" not in p and not p.get("upto"):
        return ""
    return f" [{low}:{low + width - 1}]" if p.get("upto") else f" [{low + width - 1}:{low}]"


path, top, cycles, seed = sys.argv[1], sys.argv[2], int(sys.argv[3]), int(sys.argv[4])
params = [a.split("=", 1) for a in sys.argv[5:]]
ports = list(json.load(open(path))["modules"][top]["ports"].items())
rng = random.Random(seed)
clocks = [n for n, p in ports
          if p["direction"] == "input" and len(p["bits"]) == 1 and CLOCK.match(n)]
shown = [n for n, p in ports if p["direction"] in ("output", "inout")]
driven = [(n, p) for n, p in ports if p["direction"] == "input" and n not in clocks]
driven += [("drive_" + n, p) for n, p in ports if p["direction"] == "inout"]

out = ["`timescale 1 ns/1 ps", "module nlw_tb;"]
for name, p in ports:
    out.append(f"  {'reg' if p['direction'] == 'input' else 'wire'}{declared(p)} {esc(name)};")
    if p["direction"] == "inout":
        out.append(f"  reg{declared(p)} {esc('drive_' + name)};")
        out.append(f"  assign (weak1, weak0) {esc(name)} = {esc('drive_' + name)};")
conns = ",\n    ".join(f".{esc(n)}({esc(n)})" for n, _ in ports)
overrides = f"#({', '.join(f'.{n}({v})' for n, v in params)}) " if params else ""
out += [f"  {esc(top)} {overrides}uut (\n    {conns}\n  );", "", "  initial begin"]
out += [f"    {esc(c)} = 1'b0;" for c in clocks]
for cycle in range(cycles):
    values = []
    for name, p in driven:
        width = len(p["bits"])
        if p["direction"] == "input" and RESET.match(name) and width == 1:
            value = int(cycle < 2 or rng.randrange(16) == 0) ^ bool(ACTIVE_LOW.search(name))
        else:
            value = rng.getrandbits(width)
        values.append(f"    {esc(name)} = {width}'h{value:x};")
    # The first values hold from the start, so that no input is unknown
    # when the global set/reset ends.
    out += (values if cycle == 0 else []) + [f"    #{START + 5 if cycle == 0 else PERIOD};"]
    out += values
out += [f"    #{PERIOD};", "    $finish;", "  end", ""]
if clocks:
    flips = " ".join(f"{esc(c)} = ~{esc(c)};" for c in clocks)
    out += ["  initial begin", f"    #{START};", f"    forever begin #{PERIOD // 2}; {flips} end",
            "  end", ""]
fmt = "".join(f" {n}=%b" for n in shown)
args = "".join(f", {esc(n)}" for n in shown)
out += ["  integer cycle;", "  initial begin", f"    #{START + PERIOD // 2 - 1};",
        f"    for (cycle = 0; cycle < {cycles}; cycle = cycle + 1) begin",
        f'      $display("%0d{fmt}", cycle{args});', f"      #{PERIOD};", "    end", "  end",
        "endmodule"]
print("\n".join(out))
