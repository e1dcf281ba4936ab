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


def sdf_counts(path):
    text = open(path).read()
    checks = set()
    for cell in re.split(r'\(CELL\b', text)[1:]:
        inst = re.search(r'\(INSTANCE\s*([^)]*)\)', cell).group(1).strip()
        for data, ref in re.findall(
                r'\(SETUPHOLD\s+(?:\((?:posedge|negedge)\s+)?(\S+?)\)?\s+'
                r'\((?:posedge|negedge)\s+(\S+?)\)', cell):
            checks.add((inst, data, ref))
    return {'cell arcs': text.count('(IOPATH'), 'net arcs': text.count('(INTERCONNECT'),
            'setup arcs': len(checks), 'hold arcs': len(checks)}


def sta_counts(path):
    got = {'cell arcs': 0, 'net arcs': 0, 'setup arcs': 0, 'hold arcs': 0}
    problems = []
    for line in open(path):
        if re.match(r'\s*(Error|Warning)', line):
            problems.append(line.rstrip())
        m = re.match(r'([A-Za-z ]+?)\s+(\d+)\s+(\d+)\s+(\d+)\s*$', line)
        if not m or 'arcs' not in m.group(1):
            continue
        label = m.group(1)
        key = ('net arcs' if 'net arcs' in label else
               'setup arcs' if 'setup' in label else
               'hold arcs' if 'hold' in label else 'cell arcs')
        got[key] += int(m.group(3))
    return got, problems


def main():
    want = sdf_counts(sys.argv[1])
    got, problems = sta_counts(sys.argv[2])
    ok = not problems
    for p in problems[:5]:
        print('sta: ' + p)
    for key in want:
        if want[key] != got[key]:
            print('%s: %d in the SDF, %d annotated' % (key, want[key], got[key]))
            ok = False
    print('annotated: ' + ', '.join('%s %d' % (k, got[k]) for k in got))
    sys.exit(0 if ok else 1)


main()
