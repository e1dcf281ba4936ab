#!/usr/bin/env python3
"""Writes a netlist JSON of about N leaf cells laid out exactly as yosys
write_json lays out a synthesized design, for the benchmarks.

What users' files have and this design has too: yosys's own indentation and
key order; "src" attributes on every cell and net; internal names
("$abc$...$auto$blifparse.cc:525:parse_blif$N", "$auto$ff.cc:266:slice$N")
next to public names that need escaping ("alu.sum[3]", "q-next", "1st");
constant bits in cell connections; port connections of submodule instances
that mix bits of several nets and constants; "hdlname" attributes; and one
module that the top instantiates twice, so that the reader must unfold it.

The top instantiates the shared module "pipe" twice and a chain of unique
slice modules (as a uniquified, parameterized design is written). Every slice
holds lookup tables (V_LUT4, V_LUT2) and flip-flops (V_FD, V_FDRE).

Usage: gen_yosys_design.py N OUT.json
"""

import random
import sys

W = 16                 # width of every slice's data ports
LUTS = 48              # lookup tables per slice
CELLS = LUTS + W       # cells per slice (tables and flops)
SHARED_SLICES = 4      # slices inside the shared module

LIBRARY = [
    ("V_LUT2", [("I0", "input"), ("I1", "input"), ("O", "output")], [("INIT", "0000")]),
    ("V_LUT4", [("I0", "input"), ("I1", "input"), ("I2", "input"), ("I3", "input"),
                ("O", "output")], [("INIT", "0000000000000000")]),
    ("V_FD", [("C", "input"), ("D", "input"), ("Q", "output")], [("INIT", "0")]),
    ("V_FDRE", [("C", "input"), ("CE", "input"), ("R", "input"), ("D", "input"),
                ("Q", "output")], [("INIT", "0")]),
]


def bits_text(bits):
    return "[ " + ", ".join(b if isinstance(b, str) else str(b) for b in bits) + " ]"


class Writer:
    def __init__(self, path):
        self.f = open(path, "w")
        self.serial = 1000

    def next_id(self):
        self.serial += 1
        return self.serial

    def w(self, text):
        self.f.write(text)

    def library(self):
        for name, pins, params in LIBRARY:
            self.w('    "%s": {\n      "attributes": {\n        "blackbox": "%s"\n      },\n'
                   % (name, "0" * 31 + "1"))
            self.w('      "parameter_default_values": {\n')
            self.w(",\n".join('        "%s": "%s"' % p for p in params) + "\n      },\n")
            self.w('      "ports": {\n')
            self.w(",\n".join('        "%s": {\n          "direction": "%s",\n          "bits": [ %d ]\n        }'
                              % (p, d, i + 2) for i, (p, d) in enumerate(pins)))
            self.w('\n      },\n      "cells": {\n      },\n      "netnames": {\n')
            self.w(",\n".join('        "%s": {\n          "hide_name": 0,\n          "bits": [ %d ],\n'
                              '          "attributes": {\n          }\n        }' % (p, i + 2)
                              for i, (p, _) in enumerate(pins)))
            self.w("\n      }\n    },\n")


def cell_text(name, hidden, typ, params, src, pins, conns):
    out = ['        "%s": {\n          "hide_name": %d,\n          "type": "%s",\n          "parameters": {\n'
           % (name, hidden, typ)]
    out.append(",\n".join('            "%s": "%s"' % p for p in params))
    out.append('\n          },\n          "attributes": {\n            "module_not_derived": "%s",\n'
               '            "src": "%s"\n          },\n          "port_directions": {\n' % ("0" * 31 + "1", src))
    out.append(",\n".join('            "%s": "%s"' % (p, d) for p, d in pins))
    out.append('\n          },\n          "connections": {\n')
    out.append(",\n".join('            "%s": %s' % (p, bits_text(c)) for (p, _), c in zip(pins, conns)))
    out.append("\n          }\n        }")
    return "".join(out)


def net_text(name, hidden, bits, src, hdlname=None):
    attrs = ['            "src": "%s"' % src]
    if hdlname:
        attrs.insert(0, '            "hdlname": "%s"' % hdlname)
    return ('        "%s": {\n          "hide_name": %d,\n          "bits": %s,\n          "attributes": {\n%s\n'
            "          }\n        }" % (name, hidden, bits_text(bits), ",\n".join(attrs)))


def slice_module(wr, rng, name, src_file):
    """One slice: ports clk, en, d[W], q[W]; LUTS tables and W flops."""
    nb = [2]

    def new(n):
        first = nb[0]
        nb[0] += n
        return list(range(first, first + n))

    clk, en = new(1), new(1)
    d, q = new(W), new(W)
    ports = [("clk", "input", clk), ("en", "input", en), ("d", "input", d), ("q", "output", q)]
    cells, nets = [], []
    pool = d + q + en
    line = 10
    lut_out = []
    for i in range(LUTS):
        line += 1
        src = "%s:%d.5-%d.40" % (src_file, line, line)
        o = new(1)
        if i % 8 == 7:
            ins = [rng.choice(pool), rng.choice(pool)]
            cells.append(cell_text("$abc$%d$auto$blifparse.cc:525:parse_blif$%d" % (wr.serial, wr.next_id()),
                                   1, "V_LUT2", [("INIT", "0110")], src, LIBRARY[0][1], [[x] for x in ins] + [o]))
        else:
            ins = [rng.choice(pool) for _ in range(4)]
            if i % 11 == 0:
                ins[3] = "1"          # a constant input bit, as abc leaves them
            init = "".join(rng.choice("01") for _ in range(16))
            cells.append(cell_text("$abc$%d$auto$blifparse.cc:525:parse_blif$%d" % (wr.serial, wr.next_id()),
                                   1, "V_LUT4", [("INIT", init)], src, LIBRARY[1][1], [[x] for x in ins] + [o]))
        nets.append(net_text("$abc$%d$new_n%d_" % (wr.serial, wr.next_id()), 1, o, src))
        lut_out += o
        pool.append(o[0])
    for i in range(W):
        line += 1
        src = "%s:%d.3-%d.30" % (src_file, line, line)
        dq = [lut_out[(i * 3) % LUTS]]
        if i % 2:
            cells.append(cell_text("$auto$ff.cc:266:slice$%d" % wr.next_id(), 1, "V_FD", [("INIT", "0")],
                                   src, LIBRARY[2][1], [clk, dq, [q[i]]]))
        else:
            public = "alu.sum_reg[%d]" % i if i % 4 == 0 else "$auto$ff.cc:266:slice$%d" % wr.next_id()
            cells.append(cell_text(public, 0 if i % 4 == 0 else 1, "V_FDRE", [("INIT", "1" if i % 3 else "0")],
                                   src, LIBRARY[3][1], [clk, en, ["0"], dq, [q[i]]]))
    src = "%s:1.1-90.10" % src_file
    nets.append(net_text("alu.sum", 0, q[:8] + ["1"] + q[9:], src, "alu sum"))
    nets.append(net_text("q-next", 0, lut_out[:W], src))
    for pname, _, pbits in ports:
        nets.append(net_text(pname, 0, pbits, src))
    write_module(wr, name, {}, ports, cells, nets)


def write_module(wr, name, attrs, ports, cells, nets):
    wr.w('    "%s": {\n      "attributes": {\n' % name)
    wr.w(",\n".join('        "%s": "%s"' % a for a in attrs.items()))
    wr.w("\n      },\n" if attrs else "      },\n")
    wr.w('      "ports": {\n')
    wr.w(",\n".join('        "%s": {\n          "direction": "%s",\n          "bits": %s\n        }'
                    % (p, d, bits_text(b)) for p, d, b in ports))
    wr.w('\n      },\n      "cells": {\n')
    wr.w(",\n".join(cells))
    wr.w('\n      },\n      "netnames": {\n')
    wr.w(",\n".join(nets))
    wr.w("\n      }\n    }")


def chain_module(wr, name, slices, attrs, src_file):
    """A module chaining slice instances; the q of one feeds the d of the next,
    mixed with constants and a bit of the module's own input."""
    nb = [2]

    def new(n):
        first = nb[0]
        nb[0] += n
        return list(range(first, first + n))

    clk, en, d, q = new(1), new(1), new(W), new(W)
    ports = [("clk", "input", clk), ("en", "input", en), ("d", "input", d), ("q", "output", q)]
    cells, nets = [], []
    prev = d
    for k, (inst, typ) in enumerate(slices):
        out = q if k == len(slices) - 1 else new(W)
        # Bit-mixed: two bits from the module input, one constant.
        din = prev[:W - 3] + [d[k % W], "0", d[(k + 5) % W]]
        src = "%s:%d.3-%d.60" % (src_file, 100 + k, 100 + k)
        cells.append(cell_text(inst, 0, typ, [], src,
                               [("clk", "input"), ("en", "input"), ("d", "input"), ("q", "output")],
                               [clk, en, din, out]))
        if out is not q:
            nets.append(net_text("%s.q" % inst.lstrip("\\"), 0, out, src, "%s q" % inst))
        prev = out
    src = "%s:1.1-9.9" % src_file
    for pname, _, pbits in ports:
        nets.append(net_text(pname, 0, pbits, src))
    write_module(wr, name, attrs, ports, cells, nets)


def main():
    if len(sys.argv) != 3:
        sys.exit(__doc__)
    target = int(sys.argv[1])
    rng = random.Random(13)
    wr = Writer(sys.argv[2])
    wr.w('{\n  "creator": "Yosys 0.23 (git sha1 7ce5011c24b)",\n  "modules": {\n')
    wr.library()
    unique = max(1, (target - 2 * SHARED_SLICES * CELLS) // CELLS)
    # The shared module's own slices, then the unique ones.
    for k in range(SHARED_SLICES):
        slice_module(wr, rng, "$paramod\\\\slice\\\\ID=%d" % k, "pipe.v")
        wr.w(",\n")
    chain_module(wr, "pipe", [("stage%d" % k, "$paramod\\\\slice\\\\ID=%d" % k) for k in range(SHARED_SLICES)],
                 {}, "pipe.v")
    wr.w(",\n")
    for k in range(unique):
        slice_module(wr, rng, "$paramod\\\\slice\\\\ID=%d" % (k + SHARED_SLICES), "slice.v")
        wr.w(",\n")
    top = [("pipe_a", "pipe"), ("pipe$b", "pipe")]
    top += [("gen[%d].u" % k, "$paramod\\\\slice\\\\ID=%d" % (k + SHARED_SLICES)) for k in range(unique)]
    chain_module(wr, "top", top, {"top": "0" * 31 + "1", "src": "top.v:1.1-500.10"}, "top.v")
    wr.w("\n  }\n}\n")
    wr.f.close()
    print("%d leaf cells" % ((unique + 2 * SHARED_SLICES) * CELLS))


if __name__ == "__main__":
    main()
