#!/usr/bin/env python3
"""Writes the Liberty file of the shipped cell library (share/data/nlw_cells.lib).

The pins come from the cell list (share/data/cells.dat), the timing arcs
from the specify blocks of the timing cell models (share/verilog/src/timcells),
and the delays are nominal figures per kind of arc: the cells model no
device, so the figures only give a timing analyser and a timing simulation
plausible, non-zero numbers.  Run it after changing a cell's pins or specify
block:  python3 tools/make_liberty.py > share/data/nlw_cells.lib
"""
import os
import re
import sys

HERE = os.path.dirname(os.path.abspath(__file__))
SHARE = os.path.join(HERE, '..', 'share')

# Nominal delays in ns.
PATH_DELAY = {'V_INV': 0.10, 'V_BUF': 0.12, 'V_CKBUF': 0.15, 'V_BUFGMUX': 0.20,
              'V_BUFGMUX_1': 0.20, 'V_IBUF': 0.30, 'V_IBUFDS': 0.32, 'V_OBUF': 0.40,
              'V_OBUFT': 0.40, 'V_TRI': 0.25, 'V_MUX2': 0.22, 'V_DCM': 0.50}
LUT_DELAY = 0.25
CLOCK_TO_OUT = 0.35
RAM_CLOCK_TO_OUT = 1.20
ASYNC_TO_OUT = 0.40
SETUP, HOLD = 0.10, 0.05
RECOVERY, REMOVAL = 0.12, 0.06
TRANSITION = 0.05
CAPACITANCE = 0.005


def read_cells():
    cells, cur = [], None
    for line in open(os.path.join(SHARE, 'data', 'cells.dat')):
        w = line.split()
        if not w or w[0].startswith('#'):
            continue
        if w[0] == 'cell':
            cur = {'name': w[1], 'pins': []}
            cells.append(cur)
        elif w[0] == 'pin':
            cur['pins'].append((w[1], w[2], None))
        elif w[0] == 'bus':
            cur['pins'].append((w[1], w[2], (int(w[3]), int(w[4]))))
    return cells


def read_specify(name):
    path = os.path.join(SHARE, 'verilog', 'src', 'timcells', name + '.v')
    text = open(path).read() if os.path.exists(path) else ''
    m = re.search(r'specify(.*?)endspecify', text, re.S)
    body = m.group(1) if m else ''
    paths = re.findall(r'\(\s*(posedge|negedge)?\s*(\w+)\s*[=*]>\s*\(?\s*(\w+)', body)
    setuphold = re.findall(r'\$setuphold\(\s*(posedge|negedge)\s+(\w+)\s*,\s*(\w+)', body)
    recrem = re.findall(r'\$recrem\(\s*(?:posedge|negedge)\s+(\w+)\s*,\s*(posedge|negedge)\s+(\w+)',
                        body)
    return paths, setuphold, recrem


def scalar(group, value):
    return '        %s (scalar) { values ("%.3f"); }' % (group, value)


def timing(related, ttype, sense, pairs):
    out = ['      timing () {', '        related_pin : "%s";' % related,
           '        timing_type : %s;' % ttype]
    if sense:
        out.append('        timing_sense : %s;' % sense)
    out += [scalar(g, v) for g, v in pairs]
    out.append('      }')
    return out


def cell_text(cell):
    name = cell['name']
    paths, setuphold, recrem = read_specify(name)
    clocks = {clk: edge for edge, clk, _ in setuphold}
    arcs = {}  # pin -> timing groups
    for edge, src, dst in paths:
        if src in clocks or (edge and src in ('C', 'C0', 'C1', 'CLK')):
            ttype = 'rising_edge' if (edge or clocks.get(src)) == 'posedge' else 'falling_edge'
            delay = RAM_CLOCK_TO_OUT if name.startswith('V_RAMB') else CLOCK_TO_OUT
            group = timing(src, ttype, None, [('cell_rise', delay), ('cell_fall', delay),
                                              ('rise_transition', TRANSITION),
                                              ('fall_transition', TRANSITION)])
        elif edge:
            ttype, sense = ('clear', 'negative_unate') if src in ('CLR', 'R') else \
                           ('preset', 'positive_unate')
            which = 'cell_fall' if ttype == 'clear' else 'cell_rise'
            trans = 'fall_transition' if ttype == 'clear' else 'rise_transition'
            group = timing(src, ttype, sense, [(which, ASYNC_TO_OUT), (trans, TRANSITION)])
        else:
            delay = LUT_DELAY if name.startswith('V_LUT') else PATH_DELAY.get(name, 0.2)
            group = timing(src, 'combinational', None,
                           [('cell_rise', delay), ('cell_fall', delay),
                            ('rise_transition', TRANSITION), ('fall_transition', TRANSITION)])
        arcs.setdefault(dst, []).extend(group)
    for edge, clk, data in setuphold:
        kind = 'rising' if edge == 'posedge' else 'falling'
        for t, v in (('setup', SETUP), ('hold', HOLD)):
            arcs.setdefault(data, []).extend(
                timing(clk, '%s_%s' % (t, kind), None,
                       [('rise_constraint', v), ('fall_constraint', v)]))
    for ctl, edge, clk in recrem:
        kind = 'rising' if edge == 'posedge' else 'falling'
        for t, v in (('recovery', RECOVERY), ('removal', REMOVAL)):
            arcs.setdefault(ctl, []).extend(
                timing(clk, '%s_%s' % (t, kind), None,
                       [('rise_constraint', v), ('fall_constraint', v)]))
    out = ['  cell (%s) {' % name]
    for pin, direction, rng in cell['pins']:
        if rng:
            out.append('    bus (%s) {' % pin)
            out.append('      bus_type : bus_%d_%d;' % rng)
        else:
            out.append('    pin (%s) {' % pin)
        out.append('      direction : %s;' % direction)
        if direction in ('input', 'inout'):
            out.append('      capacitance : %.3f;' % CAPACITANCE)
        if pin in clocks:
            out.append('      clock : true;')
        out += arcs.get(pin, [])
        out.append('    }')
    out.append('  }')
    return out, [p[2] for p in cell['pins'] if p[2]]


def main():
    cells = read_cells()
    body, ranges = [], set()
    for c in cells:
        text, rs = cell_text(c)
        body += text
        ranges.update(rs)
    out = ['/* Timing of the shipped cell library: pin directions, timing arcs with',
           '   nominal delays, setup, hold, recovery and removal.  Nominal figures,',
           '   not measured on a device.  Written by tools/make_liberty.py. */',
           'library (nlw_cells) {',
           '  delay_model : table_lookup;',
           '  time_unit : "1ns";',
           '  voltage_unit : "1V";',
           '  current_unit : "1mA";',
           '  pulling_resistance_unit : "1kohm";',
           '  leakage_power_unit : "1nW";',
           '  capacitive_load_unit (1, pf);',
           '  nom_process : 1;',
           '  nom_voltage : 1.2;',
           '  nom_temperature : 25;',
           '  input_threshold_pct_rise : 50;',
           '  input_threshold_pct_fall : 50;',
           '  output_threshold_pct_rise : 50;',
           '  output_threshold_pct_fall : 50;',
           '  slew_lower_threshold_pct_rise : 20;',
           '  slew_lower_threshold_pct_fall : 20;',
           '  slew_upper_threshold_pct_rise : 80;',
           '  slew_upper_threshold_pct_fall : 80;',
           '  default_max_transition : 1.0;']
    for msb, lsb in sorted(ranges):
        out += ['  type (bus_%d_%d) {' % (msb, lsb), '    base_type : array;',
                '    data_type : bit;', '    bit_width : %d;' % (abs(msb - lsb) + 1),
                '    bit_from : %d;' % msb, '    bit_to : %d;' % lsb,
                '    downto : %s;' % ('true' if msb >= lsb else 'false'), '  }']
    out += body
    out.append('}')
    sys.stdout.write('\n'.join(out) + '\n')


main()
