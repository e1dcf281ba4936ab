#!/usr/bin/env python3
"""Checks an assertion file (.svf) against its RTL and netlist.

usage: check_assertions.py FILE.svf RTL.v NETLIST.v WORKDIR

Prints the number of constant, merge and name-change records. Every
constant-register record is proven on the RTL with yosys (the register
holds the value in every reachable state, from the initial values on);
every netlist name (module, -to) is declared in the netlist. Exits 1 with
a message on the first fault.
"""

import re
import subprocess
import sys

CONSTANT = re.compile(r"^guide_register_constant -design \{(.+?)\} \{(.+?)\} ([01])$")
TARGET = re.compile(r"^guide_(register_merge|name_change) -design \{(.+?)\} .*-to \{(.+)\}$")


def main(svf, rtl, netlist, work):
    text = open(netlist).read()
    modules = dict(re.findall(r"^module (\S+ ?) \((.*?)^endmodule", text, re.M | re.S))
    counts = {"constant": 0, "merge": 0, "name": 0}
    for line in open(svf):
        line = line.rstrip("\n")
        if not line or line.startswith("#"):
            continue
        m = CONSTANT.match(line)
        if m:
            module, register, value = m.groups()
            if module not in modules and module + " " not in modules:
                sys.exit("no module %s in the netlist: %s" % (module, line))
            # The register holds its value from the start and in every step.
            script = ("read_verilog %s; hierarchy -top %s; proc; flatten; opt_clean; "
                      "sat -tempinduct -prove %s %s'b%s -set-init-undef -verify %s"
                      % (rtl, module, register, 1, value, module))
            run = subprocess.run(["yosys", "-q", "-p", script], capture_output=True, text=True,
                                 cwd=work)
            if run.returncode != 0:
                sys.exit("yosys does not prove: %s\n%s" % (line, run.stdout[-800:]))
            counts["constant"] += 1
            continue
        m = TARGET.match(line)
        if not m:
            sys.exit("unexpected line: %s" % line)
        kind, module, target = m.groups()
        body = modules.get(module) or modules.get(module + " ")
        if body is None:
            sys.exit("no module %s in the netlist: %s" % (module, line))
        # An instance: the name stands before its port map's "(".
        if not re.search(r"^\s*" + re.escape(target.rstrip()) + r"\s+\(", body, re.M):
            sys.exit("no instance %s in module %s: %s" % (target, module, line))
        counts["merge" if kind == "register_merge" else "name"] += 1
    print("%(constant)d constant, %(merge)d merge, %(name)d name-change records" % counts)


if __name__ == "__main__":
    if len(sys.argv) != 5:
        sys.exit(__doc__)
    main(*sys.argv[1:])
