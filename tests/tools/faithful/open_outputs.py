#!/usr/bin/env python3
"""The open_outputs design with the bits other flows leave open or constant,
which yosys does not write by itself; the gold design has fresh nets there
instead, which is what an open output means.

usage: open_outputs.py IN.json OUT.json GOLD.json
"""
import json
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


if __name__ == "__main__":
    open_outputs(sys.argv[1], sys.argv[2], sys.argv[3])
