#!/usr/bin/env python3
"""Writes a random-stimulus test bench for the top module of a netlist JSON.

usage: make_tb.py DESIGN.json TOP CYCLES SEED [NAME=VALUE...] > tb.v

The bench instantiates TOP as `uut`, connected by port name, with the
parameter values given (for an RTL reference whose netlist was made with
parameter overrides). Clock inputs
(one-bit inputs named clk, clock or clk_*) run with a 20 ns period; every
other input takes a new pseudo-random value 5 ns into each cycle, the same
values in every simulation of the same design. Reset-like inputs (rst, reset,
clr, clear, optionally with a suffix; a final _n or n marks active low) are held active for
the first two cycles and are active in about one cycle in sixteen after
that. Inout ports are driven weakly with random values, so that whatever the
design drives wins. Nothing happens for the first 200 ns, past the global
set/reset pulse of the chipwide module. One line per cycle, printed 1 ns
before the rising clock edge, lists every output and inout in binary.
"""

import json
import random
import re
import sys

PERIOD = 20
START = 200

CLOCK = re.compile(r"^(clk|clock)(_\w+)?$", re.IGNORECASE)
RESET = re.compile(r"^(a?rst|a?reset|clr|clear)(_?n|_\w+)?$", re.IGNORECASE)
ACTIVE_LOW = re.compile(r"(_n|^(a?rst|a?reset|clr|clear)n)$", re.IGNORECASE)


def escape(name):
    if re.match(r"^[A-Za-z_][A-Za-z0-9_$]*$", name):
        return name
    return "\\" + name + " "


def port_range(port):
    width = len(port["bits"])
    offset = port.get("offset", 0)
    if width == 1 and "offset" not in port and not port.get("upto"):
        return None
    if port.get("upto"):
        return (offset, offset + width - 1)
    return (offset + width - 1, offset)


def main():
    path, top, cycles, seed = sys.argv[1], sys.argv[2], int(sys.argv[3]), int(sys.argv[4])
    params = [a.split("=", 1) for a in sys.argv[5:]]
    with open(path) as f:
        module = json.load(f)["modules"][top]
    rng = random.Random(seed)
    ports = list(module["ports"].items())
    clocks = [n for n, p in ports if p["direction"] == "input" and len(p["bits"]) == 1
              and CLOCK.match(n)]
    inputs = [(n, p) for n, p in ports if p["direction"] == "input" and n not in clocks]
    inouts = [(n, p) for n, p in ports if p["direction"] == "inout"]
    shown = [(n, p) for n, p in ports if p["direction"] in ("output", "inout")]

    out = ["`timescale 1 ns/1 ps", "module nlw_tb;"]
    for name, p in ports:
        r = port_range(p)
        rng_text = f" [{r[0]}:{r[1]}]" if r else ""
        kind = "reg" if p["direction"] == "input" else "wire"
        out.append(f"  {kind}{rng_text} {escape(name)};")
        if p["direction"] == "inout":
            out.append(f"  reg{rng_text} {escape('drive_' + name)};")
            out.append(f"  assign (weak1, weak0) {escape(name)} = {escape('drive_' + name)};")
    conns = ",\n    ".join(f".{escape(n)}({escape(n)})" for n, _ in ports)
    overrides = ", ".join(f".{n}({v})" for n, v in params)
    out.append(f"  {escape(top)} {'#(' + overrides + ') ' if params else ''}uut (\n    {conns}\n  );")
    out.append("")
    out.append("  initial begin")
    for c in clocks:
        out.append(f"    {escape(c)} = 1'b0;")
    driven = inputs + [("drive_" + n, p) for n, p in inouts]
    for cycle in range(cycles):
        values = []
        for name, p in driven:
            width = len(p["bits"])
            if p["direction"] == "input" and RESET.match(name) and width == 1:
                active = cycle < 2 or rng.randrange(16) == 0
                value = (0 if active else 1) if ACTIVE_LOW.search(name) else (1 if active else 0)
            else:
                value = rng.getrandbits(width)
            values.append(f"    {escape(name)} = {width}'h{value:x};")
        if cycle == 0:
            # The first values hold from the start, so that no input is
            # unknown when the global set/reset ends.
            out.extend(values)
        out.append(f"    #{START + 5 if cycle == 0 else PERIOD};")
        out.extend(values)
    out.append(f"    #{PERIOD};")
    out.append("    $finish;")
    out.append("  end")
    out.append("")
    if clocks:
        out.append("  initial begin")
        out.append(f"    #{START};")
        clock_list = " ".join(f"{escape(c)} = ~{escape(c)};" for c in clocks)
        out.append(f"    forever begin #{PERIOD // 2}; {clock_list} end")
        out.append("  end")
        out.append("")
    fmt = " ".join(f"{n}=%b" for n, _ in shown)
    args = ", ".join(escape(n) for n, _ in shown)
    out.append("  integer cycle;")
    out.append("  initial begin")
    out.append(f"    #{START + PERIOD // 2 - 1};")
    out.append(f"    for (cycle = 0; cycle < {cycles}; cycle = cycle + 1) begin")
    if shown:
        out.append(f'      $display("%0d {fmt}", cycle, {args});')
    else:
        out.append('      $display("%0d", cycle);')
    out.append(f"      #{PERIOD};")
    out.append("    end")
    out.append("  end")
    out.append("endmodule")
    print("\n".join(out))


if __name__ == "__main__":
    main()
