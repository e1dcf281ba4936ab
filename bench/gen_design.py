#!/usr/bin/env python3
"""Writes a netlist JSON (the layout yosys write_json uses) of about N leaf
cells for the load benchmark.

The design has two levels of hierarchy: the top chains K mid modules, each
mid chains 16 leaf-only blocks, each block holds 48 four-input lookup tables
(V_LUT4 with a 16-bit INIT) and 16 flip-flops (V_FD). Ports and nets are
16-bit buses (one of them declared [0:15]); names include internal "$" names
and names that need escaping in Verilog ("data-bus", "q.next", "1st/stage").

By default every mid and block is its own module, so the file describes all
N cells, as a uniquified netlist does. With --shared the top instantiates K
copies of one mid module, which instantiates copies of one block: the file
is then small and the load is all unfolding.

Usage: gen_design.py N OUT.json [--shared]
"""

import random
import sys

WIDTH = 16
BLOCKS_PER_MID = 16
LUTS_PER_BLOCK = 48
CELLS_PER_BLOCK = LUTS_PER_BLOCK + WIDTH


class Module:
    """Collects one module's ports, cells and net names as JSON text."""

    def __init__(self, name):
        self.name = name
        self.next_bit = 2
        self.ports = []
        self.cells = []
        self.nets = []

    def bits(self, n):
        first = self.next_bit
        self.next_bit += n
        return list(range(first, first + n))

    def port(self, name, direction, bits, upto=False):
        extra = '          "upto": 1,\n' if upto else ""
        self.ports.append(
            f'        "{name}": {{\n'
            f'          "direction": "{direction}",\n'
            f"{extra}"
            f'          "bits": [ {", ".join(map(str, bits))} ]\n'
            f"        }}"
        )
        self.net(name, bits, upto=upto)

    def net(self, name, bits, hidden=False, upto=False, hdlname=None):
        extra = '          "upto": 1,\n' if upto else ""
        attrs = f'            "hdlname": "{hdlname}"\n' if hdlname else ""
        self.nets.append(
            f'        "{name}": {{\n'
            f'          "hide_name": {1 if hidden else 0},\n'
            f'          "bits": [ {", ".join(map(str, bits))} ],\n'
            f"{extra}"
            f'          "attributes": {{\n{attrs}          }}\n'
            f"        }}"
        )

    def cell(self, name, ctype, conns, dirs, params=None, hidden=False):
        par = ",\n".join(f'            "{k}": "{v}"' for k, v in (params or {}).items())
        pdir = ",\n".join(f'            "{k}": "{dirs[k]}"' for k in conns)
        con = ",\n".join(
            f'            "{k}": [ {", ".join(map(str, v))} ]' for k, v in conns.items()
        )
        self.cells.append(
            f'        "{name}": {{\n'
            f'          "hide_name": {1 if hidden else 0},\n'
            f'          "type": "{ctype}",\n'
            f'          "parameters": {{\n{par + chr(10) if par else ""}          }},\n'
            f'          "attributes": {{\n          }},\n'
            f'          "port_directions": {{\n{pdir}\n          }},\n'
            f'          "connections": {{\n{con}\n          }}\n'
            f"        }}"
        )

    def text(self, attributes):
        attrs = ",\n".join(f'        "{k}": "{v}"' for k, v in attributes.items())
        return (
            f'    "{self.name}": {{\n'
            f'      "attributes": {{\n{attrs + chr(10) if attrs else ""}      }},\n'
            f'      "ports": {{\n' + ",\n".join(self.ports) + "\n      },\n"
            f'      "cells": {{\n' + ",\n".join(self.cells) + "\n      },\n"
            f'      "netnames": {{\n' + ",\n".join(self.nets) + "\n      }\n"
            f"    }}"
        )


LUT_DIRS = {"I0": "input", "I1": "input", "I2": "input", "I3": "input", "O": "output"}
FD_DIRS = {"C": "input", "D": "input", "Q": "output"}
SUB_DIRS = {"clk": "input", "din": "input", "dout": "output"}


def block(name, rng):
    """A leaf-only module: three layers of lookup tables feeding flip-flops."""
    m = Module(name)
    clk, din, dout = m.bits(1), m.bits(WIDTH), m.bits(WIDTH)
    m.port("clk", "input", clk)
    m.port("din", "input", din)
    m.port("dout", "output", dout)
    layer0, layer1, layer2 = m.bits(WIDTH), m.bits(WIDTH), m.bits(WIDTH)
    m.net("data-bus", layer0)
    for i, b in enumerate(layer1):
        m.net(f"$abc$n1${i}", [b], hidden=True)
    m.net("q.next", layer2, upto=True, hdlname="stage q.next")
    m.net("1st/stage", [layer1[0]])
    w = WIDTH
    count = 0
    for layer, (outs, ins) in enumerate(
        [
            (layer0, lambda i: [din[i], din[(i + 1) % w], din[(i + 2) % w], din[(i + 3) % w]]),
            (layer1, lambda i: [layer0[i], layer0[(i + 1) % w], dout[i], din[i]]),
            (layer2, lambda i: [layer1[i], layer1[(i + 1) % w], layer0[i], dout[(i + 1) % w]]),
        ]
    ):
        for i in range(w):
            a = ins(i)
            conns = {"I0": [a[0]], "I1": [a[1]], "I2": [a[2]], "I3": [a[3]], "O": [outs[i]]}
            init = format(rng.getrandbits(16), "016b")
            hidden = layer == 1
            cname = f"$abc$lut${count}" if hidden else f"lut_{layer}_{i}"
            m.cell(cname, "V_LUT4", conns, LUT_DIRS, {"INIT": init}, hidden)
            count += 1
    for i in range(w):
        conns = {"C": clk, "D": [layer2[(w - 1) - i]], "Q": [dout[i]]}
        m.cell(f"state.q[{i}]", "V_FD", conns, FD_DIRS)
    return m


def chain(name, children):
    """A module that chains instances of the given modules on a 16-bit bus."""
    m = Module(name)
    clk, din, dout = m.bits(1), m.bits(WIDTH), m.bits(WIDTH)
    m.port("clk", "input", clk)
    m.port("din", "input", din)
    m.port("dout", "output", dout)
    prev = din
    for j, child in enumerate(children):
        out = dout if j == len(children) - 1 else m.bits(WIDTH)
        if out is not dout:
            m.net(f"link{j}", out)
        m.cell(f"u{j}", child, {"clk": clk, "din": prev, "dout": out}, SUB_DIRS)
        prev = out
    return m


def main():
    args = [a for a in sys.argv[1:] if not a.startswith("--")]
    shared = "--shared" in sys.argv[1:]
    if len(args) != 2:
        sys.exit(__doc__)
    n, out = int(args[0]), args[1]
    mids = max(1, round(n / (BLOCKS_PER_MID * CELLS_PER_BLOCK)))
    rng = random.Random(1)
    with open(out, "w") as f:
        f.write('{\n  "creator": "gen_design.py",\n  "modules": {\n')
        first = True

        def emit(module, attributes=None):
            nonlocal first
            if not first:
                f.write(",\n")
            first = False
            f.write(module.text(attributes or {}))

        mid_names = []
        for k in range(1 if shared else mids):
            blocks = []
            for j in range(1 if shared else BLOCKS_PER_MID):
                bname = "blk" if shared else f"blk_{k}_{j}"
                emit(block(bname, rng))
                blocks.append(bname)
            if shared:
                blocks = blocks * BLOCKS_PER_MID
            mname = "mid" if shared else f"mid_{k}"
            emit(chain(mname, blocks))
            mid_names.append(mname)
        if shared:
            mid_names = mid_names * mids
        emit(chain("top", mid_names), {"top": "00000000000000000000000000000001"})
        f.write("\n  }\n}\n")
    cells = mids * BLOCKS_PER_MID * CELLS_PER_BLOCK
    print(f"{out}: {cells} cells, {mids} mid modules{' (shared)' if shared else ''}")


if __name__ == "__main__":
    main()
