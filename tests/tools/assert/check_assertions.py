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

if len(sys.argv) != 5:
    sys.exit(__doc__)
svf, rtl, netlist, work = sys.argv[1:]
modules = {m.rstrip(): body for m, body in
           re.findall(r"^module (\S+ ?) \((.*?)^endmodule", open(netlist).read(), re.M | re.S)}
counts = {"constant": 0, "register_merge": 0, "name_change": 0}
for line in open(svf).read().splitlines():
    m, t = CONSTANT.match(line), TARGET.match(line)
    if not line or line.startswith("#"):
        continue
    if not m and not t:
        sys.exit("unexpected line: %s" % line)
    module = (m or t).group(1 if m else 2)
    if module.rstrip() not in modules:
        sys.exit("no module %s in the netlist: %s" % (module, line))
    if m:
        # The register holds its value from the start and in every step.
        register, value = m.group(2), m.group(3)
        script = ("read_verilog %s; hierarchy -top %s; proc; flatten; opt_clean; "
                  "sat -tempinduct -prove %s 1'b%s -set-init-undef -verify %s"
                  % (rtl, module, register, value, module))
        run = subprocess.run(["yosys", "-q", "-p", script], capture_output=True, text=True,
                             cwd=work)
        if run.returncode != 0:
            sys.exit("yosys does not prove: %s\n%s" % (line, run.stdout[-800:]))
        counts["constant"] += 1
        continue
    # An instance: the name stands before its port map's "(".
    instance = r"^\s*" + re.escape(t.group(3).rstrip()) + r"\s+\("
    if not re.search(instance, modules[module.rstrip()], re.M):
        sys.exit("no instance %s in module %s: %s" % (t.group(3), module, line))
    counts[t.group(1)] += 1
print("%(constant)d constant, %(register_merge)d merge, %(name_change)d name-change records"
      % counts)
