#!/usr/bin/env python3
"""Writes netlist JSON designs whose internal names are hostile to Verilog
tools: blanks, brackets, backslashes, quotes, dots, slashes, '$', leading
digits, keywords of every Verilog and SystemVerilog standard, bytes above 127,
3000-character names, names differing only in case, names that collide once
legalized, and bus members next to scalars of the same base name. Ports keep
plain names so that the written netlist can be proven against the design.
Usage: gen_hostile.py HOSTILE.json NEUTRAL.json"""
import json
import sys

HOSTILE = [
    "a b", "a_b", "x[3]", "back\\slash", 'quo"te', "dot.ted", "sl/ash", "$dollar",
    "9digit", "module", "signed", "generate", "logic", "bit", "bool", "always", "wire",
    "input", "uwire", "config", "localparam", "endmodule", "caf\u00e9", "\u00fcber",
    "Net", "net", "NET", "tab\there", "semi;colon", "paren(1)", "star*/", "//comment",
    "line\nbreak", "d[1]", "d", "q[0]", "w" * 3000, "w" * 2999 + "x", "[7]", " lead", "trail ", "\\esc ", "\\a b ",
]

CELLS = [("$_AND_", ["A", "B"]), ("$_OR_", ["A", "B"]), ("$_XOR_", ["A", "B"]),
         ("$_NOT_", ["A"]), ("$_MUX_", ["A", "B", "S"])]


class Module:
    def __init__(self, bit0):
        self.next_bit = bit0
        self.ports, self.cells, self.netnames = {}, {}, {}

    def bits(self, n):
        b = list(range(self.next_bit, self.next_bit + n))
        self.next_bit += n
        return b

    def port(self, name, direction, bits):
        self.ports[name] = {"direction": direction, "bits": bits}
        self.netnames.setdefault(name, {"hide_name": 0, "bits": bits, "attributes": {}})

    def net(self, name, bits):
        self.netnames[name] = {"hide_name": 1 if name.startswith("$") else 0,
                               "bits": bits, "attributes": {}}

    def cell(self, name, ctype, conns, dirs):
        self.cells[name] = {"hide_name": 1 if name.startswith("$") else 0, "type": ctype,
                            "parameters": {}, "attributes": {},
                            "port_directions": dirs, "connections": conns}

    def json(self, top=False):
        m = {"attributes": {}, "ports": self.ports, "cells": self.cells,
             "netnames": self.netnames}
        if top:
            m["attributes"]["top"] = "00000000000000000000000000000001"
        return m


def logic_cloud(m, inputs, names, cell_names, count):
    """Chains count gates over the input bits; gate i drives a net named
    names[i] and is named cell_names[i]. Returns the driven bits."""
    pool = list(inputs)
    outs = []
    for i in range(count):
        ctype, pins = CELLS[i % len(CELLS)]
        y = m.bits(1)
        conns = {p: [pool[(i * 7 + k * 3) % len(pool)]] for k, p in enumerate(pins)}
        conns["Y"] = y
        dirs = {p: "input" for p in pins}
        dirs["Y"] = "output"
        m.cell(cell_names[i % len(cell_names)] if i < len(cell_names) else f"g{i}", ctype, conns, dirs)
        if i < len(names):
            m.net(names[i], y)
        pool.append(y[0])
        outs.append(y[0])
    return outs


def design():
    sub = Module(100)
    a, b, c = sub.bits(1), sub.bits(1), sub.bits(1)
    sub.port("a", "input", a)
    sub.port("b", "input", b)
    sub.port("c", "input", c)
    outs = logic_cloud(sub, a + b + c, HOSTILE[::-1], HOSTILE, 12)
    sub.port("y", "output", [outs[-1]])
    sub.port("z", "output", [outs[-2]])

    top = Module(2)
    clk = top.bits(1)
    din = top.bits(4)
    top.port("clk", "input", clk)
    top.port("din", "input", din)
    # A bus and scalars sharing its base name, and hostile bus names.
    top.net("d", din)
    cloud = logic_cloud(top, din, HOSTILE, HOSTILE[5:] + HOSTILE[:5], len(HOSTILE))
    q = top.bits(4)
    for i in range(4):
        top.cell(["reg", "reg ", "always", "q[0]"][i], "$_DFF_P_",
                 {"C": clk, "D": [cloud[-1 - i]], "Q": [q[i]]},
                 {"C": "input", "D": "input", "Q": "output"})
    top.net("q", q)
    top.net("q[1]", [cloud[3]])
    sy, sz = top.bits(1), top.bits(1)
    for i, inst in enumerate(["sub inst", "module", "Sub"]):
        y, z = (sy, sz) if i == 0 else (top.bits(1), top.bits(1))
        top.cells[inst] = {"hide_name": 0, "type": "sub mod", "parameters": {}, "attributes": {},
                           "connections": {"a": [din[i]], "b": [cloud[i]], "c": [q[i]],
                                           "y": y, "z": z}}
        top.net(["s y", "s.z", "s\\w"][i], y)
    top.port("dout", "output", q)
    top.port("sy", "output", sy)
    top.port("sz", "output", sz)
    top.port("k", "output", [cloud[5], cloud[9], "0", "1"])
    return {"creator": "gen_hostile.py", "modules": {"top": top.json(top=True),
                                                     "sub mod": sub.json()}}


def neutral(d):
    """The same design with every module, cell and net name replaced by a
    plain one (ports keep theirs): what yosys itself can read."""
    renamed = {}

    def name(kind, old):
        return renamed.setdefault((kind, old), f"{kind}{len(renamed)}")

    out = {"creator": d["creator"], "modules": {}}
    for mname, m in d["modules"].items():
        cells = {}
        for cname, c in m["cells"].items():
            c = dict(c)
            if c["type"] in d["modules"]:
                c["type"] = name("m", c["type"])
            cells[name("c", cname)] = c
        nets = {(n if n in m["ports"] else name("n", n)): v for n, v in m["netnames"].items()}
        out["modules"][name("m", mname) if mname != "top" else "top"] = dict(
            m, cells=cells, netnames=nets)
    return out


if __name__ == "__main__":
    d = design()
    with open(sys.argv[1], "w", encoding="utf-8") as f:
        json.dump(d, f, indent=1, ensure_ascii=False)
    with open(sys.argv[2], "w", encoding="utf-8") as f:
        json.dump(neutral(d), f, indent=1)
