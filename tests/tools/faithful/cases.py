#!/usr/bin/env python3
"""Designs for test_faithful.sh that yosys does not write by itself.

  cases.py open IN.json OUT.json GOLD.json
                                   the open_outputs design with the bits
                                   other flows leave open or constant; the
                                   gold design has fresh nets there instead,
                                   which is what an open output means
  cases.py gen DIR                 hand-made designs: names, parameters,
                                   and faulty inputs (bad_*.json)
"""
import json
import os
import sys


def replace_bits(bits, old, new):
    return [new if b == old else b for b in bits]


def fresh_outputs(d):
    """Open ("x") and constant bits of cell outputs become nets of their own."""
    fresh = [10000]

    def new():
        fresh[0] += 1
        return fresh[0]
    for m in d["modules"].values():
        for cell in m["cells"].values():
            for pin, bits in cell["connections"].items():
                out = cell["type"] == "sub" or pin == "Y"
                if out:
                    cell["connections"][pin] = [new() if isinstance(b, str) else b for b in bits]


def open_outputs(src, dst, gold):
    d = json.load(open(src))
    top = d["modules"]["top"]
    for cell in top["cells"].values():
        if cell["type"] == "sub":
            conns = cell["connections"]
            conns["y"] = conns["y"][:2] + ["x", "x"]  # used in part
            conns["z"] = ["x"] * len(conns["z"])  # not used at all
    for net in ("y", "z"):
        top["netnames"].pop(net, None)
    sub = d["modules"]["sub"]
    # An input bit the design ties inside the module.
    tied = sub["ports"]["a"]["bits"][3]
    sub["ports"]["a"]["bits"] = replace_bits(sub["ports"]["a"]["bits"], tied, "0")
    for net in sub["netnames"].values():
        net["bits"] = replace_bits(net["bits"], tied, "0")
    # A cell output tied to a constant.
    first = True
    for cell in sub["cells"].values():
        for pin, bits in cell["connections"].items():
            cell["connections"][pin] = replace_bits(bits, tied, "0")
        if first and cell["type"] == "$_NOT_" and cell["connections"]["Y"] != ["0"]:
            cell["connections"]["Y"] = ["0"]
            first = False
    json.dump(d, open(dst, "w"), indent=1)
    fresh_outputs(d)
    json.dump(d, open(gold, "w"), indent=1)


def module(ports, cells, nets=None, attrs=None):
    m = {"ports": ports, "cells": cells, "netnames": nets or {}}
    if attrs:
        m["attributes"] = attrs
    return m


def port(direction, bits, **extra):
    p = {"direction": direction, "bits": bits}
    p.update(extra)
    return p


def lut4(init, name="INIT", a=(2, 3, 4, 5), y=6):
    return {"type": "V_LUT4", "parameters": {name: init},
            "connections": {"I0": [a[0]], "I1": [a[1]], "I2": [a[2]], "I3": [a[3]], "O": [y]}}


def lut_top(cells):
    return {"modules": {"top": module(
        {"a": port("input", [2, 3, 4, 5]), "y": port("output", [6, 7])}, cells)}}


LONG = "n" * 300000


def gen(out):
    def write(name, design):
        with open(os.path.join(out, name), "w") as f:
            json.dump(design, f)

    # Values no number of the radix they claim.
    for k, value in enumerate(["NaN", "xyz", "1 2", "-1"]):
        write("badinit_%d.json" % k, lut_top({"lut": lut4(value), "keep": lut4("8000", y=7)}))
    # Parameter names in another case than the model's, and two names of
    # one model parameter.
    write("param_names.json", {"modules": {"top": module(
        {"clk": port("input", [2]), "a": port("input", [3, 4, 5, 6]), "q": port("output", [7]),
         "y": port("output", [8])},
        {"lut": lut4("0110100110010110", name="init", a=(3, 4, 5, 6), y=8),
         "ff": {"type": "V_FD", "parameters": {"INITSTATE": "1", "INIT": "0"},
                "connections": {"C": [2], "D": [8], "Q": [7]}}})}})
    # Names that break tools: black-box module and pin names, library pin
    # names, names of 300 000 characters of every kind, empty names, a
    # module named chipwide.
    write("names.json", {"modules": {
        "my cell": module({"A b": port("input", [2]), "endmodule": port("output", [3]),
                           "": port("output", [4])}, {}, attrs={"blackbox": 1}),
        "chipwide": module({"a": port("input", [2]), "y": port("output", [3])},
                           {"i": {"type": "$_NOT_", "port_directions": {"A": "input", "Y": "output"},
                                  "connections": {"A": [2], "Y": [3]}}}),
        LONG: module({LONG: port("input", [2]), "y": port("output", [3])},
                     {LONG: {"type": "$_NOT_", "port_directions": {"A": "input", "Y": "output"},
                             "connections": {"A": [2], "Y": [3]}}},
                     {LONG + "w": {"bits": [2]}}),
        "top": module(
            {"a": port("input", [2]), "b": port("input", [3]), "y": port("output", [4, 5, 6]),
             "": port("output", [7]), "z": port("output", [8]), "`x": port("output", [9])},
            {"bb": {"type": "my cell", "connections": {"A b": [2], "endmodule": [4], "": [5]}},
             "cw": {"type": "chipwide", "connections": {"a": [3], "y": [6]}},
             "long": {"type": LONG, "connections": {LONG: [2], "y": [7]}},
             "u`1": {"type": "", "port_directions": {"A": "input", "Y": "output"},
                     "connections": {"A": [3], "Y": [8]}},
             "nopins": {"type": "$_BUF_", "port_directions": {"A": "input", "Y": "output"},
                        "connections": {"A": [2], "Y": [9]}},
             # Parameter names that must be escaped or cannot be written.
             "params": {"type": "my cell", "parameters": {"a-b": 1, "c d": 2, LONG: 3},
                        "connections": {"A b": [3]}}},
            attrs={"top": 1})}})

    # Faulty inputs: each is an error naming the file and the object.
    def top_with(ports=None, cells=None, nets=None):
        return {"modules": {"top": module(
            ports or {"a": port("input", [2]), "y": port("output", [3])}, cells or {},
            nets)}}
    buf = {"type": "V_BUF", "connections": {"I": [2], "O": [3]}}
    write("bad_no_direction.json", top_with(ports={"a": {"bits": [2]}}))
    write("bad_offset.json", top_with(ports={"a": port("input", [2, 4], offset=2**63 - 1),
                                             "y": port("output", [3])}))
    write("bad_offset_low.json", top_with(ports={"a": port("input", [2], offset=-2**63),
                                                 "y": port("output", [3])}))
    write("bad_unknown_pin.json", top_with(cells={"u": {"type": "V_BUF", "connections": {
        "I": [2], "O": [3], "NOPE": [2]}}}))
    write("bad_unknown_input.json", top_with(cells={"u": {"type": "V_LUT3", "connections": {
        "I0": [2], "I1": [2], "I2": [2], "I3": [2], "O": [3]}}}))
    write("bad_nul.json", top_with(cells={"u\u0000v": buf}))
    text = json.dumps(top_with(cells={"u": buf}))
    # simdjson keeps both members of a key given twice.
    with open(os.path.join(out, "bad_duplicate_cell.json"), "w") as f:
        f.write(text.replace('"cells": {"u": ', '"cells": {"u": %s, "u": ' % json.dumps(buf)))


if __name__ == "__main__":
    if sys.argv[1] == "open":
        open_outputs(sys.argv[2], sys.argv[3], sys.argv[4])
    else:
        gen(sys.argv[2])
