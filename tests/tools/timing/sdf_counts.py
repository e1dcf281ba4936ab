#!/usr/bin/env python3
"""Checks what a static timing analyser annotated against an SDF file.

usage: sdf_counts.py ROUTED.sdf STA.log

Counts the SDF file's IOPATH and INTERCONNECT entries and its SETUPHOLD
checks (one per instance, checked pin and reference pin: the rising and
falling data edges of one pin annotate one check), and compares them with
the annotated counts of OpenSTA's report_annotated_delay and
report_annotated_check in the log: cell arcs, net arcs (all kinds), setup
and hold arcs. The log must hold no error or warning. Exits 1 on any
difference.
"""
import re
import sys

text = open(sys.argv[1]).read()
checks = {(re.search(r"\(INSTANCE\s*([^)]*)\)", cell).group(1).strip(), data, ref)
          for cell in re.split(r"\(CELL\b", text)[1:]
          for data, ref in re.findall(r"\(SETUPHOLD\s+(?:\((?:posedge|negedge)\s+)?(\S+?)\)?\s+"
                                      r"\((?:posedge|negedge)\s+(\S+?)\)", cell)}
want = {"cell arcs": text.count("(IOPATH"), "net arcs": text.count("(INTERCONNECT"),
        "setup arcs": len(checks), "hold arcs": len(checks)}
got = dict.fromkeys(want, 0)
problems = []
for line in open(sys.argv[2]):
    if re.match(r"\s*(Error|Warning)", line):
        problems.append("sta: " + line.rstrip())
    m = re.match(r"([A-Za-z ]+?)\s+(\d+)\s+(\d+)\s+(\d+)\s*$", line)
    if m and "arcs" in m.group(1):
        label = m.group(1)
        got["net arcs" if "net arcs" in label else "setup arcs" if "setup" in label
            else "hold arcs" if "hold" in label else "cell arcs"] += int(m.group(3))
problems = problems[:5] + [f"{k}: {want[k]} in the SDF, {got[k]} annotated"
                           for k in want if want[k] != got[k]]
print("\n".join(problems + ["annotated: " + ", ".join(f"{k} {got[k]}" for k in got)]))
sys.exit(1 if problems else 0)
