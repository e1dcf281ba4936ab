#!/usr/bin/env python3
"""Replicates a module of a yosys netlist JSON as uniquified copies until the
design holds about N leaf cells, keeping yosys's own text of the module.

The copies cpu_0 ... cpu_K-1 are chained by a new top module: each copy's
"instr" input is the previous copy's "dout" output, the first takes the top's
"instr"; all share clk, rst and din; the last copy's outputs are the top's.
Used with the small CPU of bench/rtl, synthesized by flow/rtl2json -noiopad -keepbuses.

Usage: gen_replicated.py SYNTH.json MODULE N OUT.json
"""

import json
import sys


def module_text(lines, name):
    start = lines.index('    "%s": {' % name)
    end = start + 1
    while not lines[end].startswith("    }"):
        end += 1
    return lines[start + 1:end + 1]


def main():
    if len(sys.argv) != 5:
        sys.exit(__doc__)
    src, name, target, out = sys.argv[1], sys.argv[2], int(sys.argv[3]), sys.argv[4]
    with open(src) as f:
        text = f.read()
    design = json.loads(text)
    cells = len(design["modules"][name]["cells"])
    copies = max(2, (target + cells - 1) // cells)
    lines = text.split("\n")
    body = "\n".join(module_text(lines, name)).rstrip(",")
    # The copies are no longer the top.
    flag = '"top": "%s"' % ("0" * 31 + "1")
    body = body.replace(flag + ",\n        ", "").replace(",\n        " + flag, "").replace("\n        " + flag, "")
    ports = design["modules"][name]["ports"]
    with open(out, "w") as f:
        f.write('{\n  "creator": %s,\n  "modules": {\n' % json.dumps(design["creator"]))
        for other in design["modules"]:
            if other != name:
                f.write('    "%s": {\n' % other)
                f.write("\n".join(module_text(lines, other)).rstrip(",") + ",\n")
        for k in range(copies):
            f.write('    "cpu_%d": {\n%s,\n' % (k, body))
        # The top: shared inputs, chained instr/dout, the last copy's outputs.
        bit = [2]

        def new(n):
            first = bit[0]
            bit[0] += n
            return list(range(first, first + n))

        top_ports = {p: new(len(v["bits"])) for p, v in ports.items()}
        cell_texts, nets = [], []
        prev = top_ports["instr"]
        for k in range(copies):
            last = k == copies - 1
            conn = {}
            for p, v in ports.items():
                if p == "instr":
                    conn[p] = prev
                elif v["direction"] == "input":
                    conn[p] = top_ports[p]
                elif last:
                    conn[p] = top_ports[p]
                else:
                    conn[p] = new(len(v["bits"]))
                    nets.append(("u_%d.%s" % (k, p), conn[p]))
            prev = conn["dout"]
            dirs = ",\n".join('            "%s": "%s"' % (p, v["direction"]) for p, v in ports.items())
            cons = ",\n".join('            "%s": [ %s ]' % (p, ", ".join(map(str, conn[p]))) for p in ports)
            cell_texts.append(
                '        "u_%d": {\n          "hide_name": 0,\n          "type": "cpu_%d",\n'
                '          "parameters": {\n          },\n          "attributes": {\n'
                '            "src": "top.v:%d.3-%d.40"\n          },\n'
                '          "port_directions": {\n%s\n          },\n          "connections": {\n%s\n'
                "          }\n        }" % (k, k, k + 10, k + 10, dirs, cons))
        f.write('    "top": {\n      "attributes": {\n        "top": "%s",\n        "src": "top.v:1.1-9.9"\n'
                "      },\n" % ("0" * 31 + "1"))
        f.write('      "ports": {\n' + ",\n".join(
            '        "%s": {\n          "direction": "%s",\n          "bits": [ %s ]\n        }'
            % (p, v["direction"], ", ".join(map(str, top_ports[p]))) for p, v in ports.items()))
        f.write('\n      },\n      "cells": {\n' + ",\n".join(cell_texts) + '\n      },\n      "netnames": {\n')
        nets = [(p, top_ports[p]) for p in ports] + nets
        f.write(",\n".join('        "%s": {\n          "hide_name": 0,\n          "bits": [ %s ],\n'
                           '          "attributes": {\n            "src": "top.v:2.3-2.20"\n          }\n        }'
                           % (n, ", ".join(map(str, b))) for n, b in nets))
        f.write("\n      }\n    }\n  }\n}\n")
    print("%d copies of %s, %d leaf cells" % (copies, name, copies * cells))


if __name__ == "__main__":
    main()
