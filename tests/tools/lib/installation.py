"""Readers of the installation's data files (share/data), shared by the
end-to-end check scripts."""

import os
import re


class Pin:
    def __init__(self, name, direction, msb=None, lsb=None, pad=False):
        self.name = name
        self.direction = direction
        self.msb = msb
        self.lsb = lsb
        self.pad = pad

    @property
    def is_bus(self):
        return self.msb is not None

    @property
    def width(self):
        return abs(self.msb - self.lsb) + 1 if self.is_bus else 1


class Cell:
    def __init__(self, name, klass, pad):
        self.name = name
        self.klass = klass
        self.pad = pad
        self.pins = []


def _lines(path):
    with open(path) as f:
        for number, raw in enumerate(f, 1):
            line = raw.split("#", 1)[0].strip()
            if line:
                yield number, line


def read_cells(path):
    """The cells of cells.dat, in file order."""
    cells = []
    for number, line in _lines(path):
        words = line.split()
        where = f"{path}:{number}"
        if words[0] == "cell":
            if len(words) not in (3, 4) or words[2] not in ("timcell", "funcell"):
                raise ValueError(f"{where}: bad cell line: {line}")
            if len(words) == 4 and words[3] != "pad":
                raise ValueError(f"{where}: bad cell flag: {words[3]}")
            cells.append(Cell(words[1], words[2], len(words) == 4))
        elif words[0] in ("pin", "bus"):
            if not cells:
                raise ValueError(f"{where}: pin before the first cell")
            if words[2] not in ("input", "output", "inout"):
                raise ValueError(f"{where}: bad direction: {words[2]}")
            if words[0] == "pin":
                if len(words) not in (3, 4) or (len(words) == 4 and words[3] != "pad"):
                    raise ValueError(f"{where}: bad pin line: {line}")
                cells[-1].pins.append(Pin(words[1], words[2], pad=len(words) == 4))
            else:
                if len(words) != 5:
                    raise ValueError(f"{where}: bad bus line: {line}")
                cells[-1].pins.append(Pin(words[1], words[2], int(words[3]), int(words[4])))
        else:
            raise ValueError(f"{where}: unknown line: {line}")
    return cells


def read_simprops(path):
    """Cell type -> [(parameter, type, default)] of simprops.dat."""
    table = {}
    for number, line in _lines(path):
        words = line.split()
        if len(words) != 4 or words[2].upper() not in ("BL", "F", "I", "S", "HV", "BV"):
            raise ValueError(f"{path}:{number}: bad property line: {line}")
        table.setdefault(words[0], []).append((words[1], words[2].upper(), words[3]))
    return table


def read_keys(path):
    """KEY -> [item] of a device data file ('KEY = item,item,...')."""
    keys = {}
    for number, line in _lines(path):
        m = re.match(r"^(\w+)\s*=\s*(.*)$", line)
        if not m:
            raise ValueError(f"{path}:{number}: bad key line: {line}")
        items = [i.strip() for i in m.group(2).split(",") if i.strip()]
        keys.setdefault(m.group(1), []).extend(items)
    return keys


def recursive_inclusions(acd_path):
    """Cell type -> models to copy before it."""
    deps = {}
    for item in read_keys(acd_path).get("RecursiveInclusion", []):
        pieces = item.split(":")
        # A single name stands for the model itself, no dependency.
        deps.setdefault(pieces[0].upper(), []).extend(pieces[1:])
    return deps


def big_ending(acd_path):
    """Cell type -> set of bus names (None for all buses)."""
    result = {}
    for item in read_keys(acd_path).get("BigEndingTimcell", []):
        pieces = item.split(":")
        if len(pieces) == 1:
            result[pieces[0].upper()] = None
        else:
            result.setdefault(pieces[0].upper(), set()).update(p.upper() for p in pieces[1:])
    return result


class Installation:
    def __init__(self, share):
        self.share = share
        self.data = os.path.join(share, "data")
        self.src = os.path.join(share, "verilog", "src")
        self.cells = read_cells(os.path.join(self.data, "cells.dat"))
        self.simprops = read_simprops(os.path.join(self.data, "simprops.dat"))
        self.acd = os.path.join(self.data, "vdm2ver.acd")

    def model(self, library, name):
        return os.path.join(self.src, library, name + ".v")
