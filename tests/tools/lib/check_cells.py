#!/usr/bin/env python3
"""Checks the installation's cell library against its data files.

usage: check_cells.py SHARE_DIR WORK_DIR

For every cell of cells.dat:
  - both models exist (timcells/ and funcells/);
  - the timcell compiles with Icarus Verilog (-g2005) together with
    chipwide.v and the models its RecursiveInclusion entry names, connected
    pin by pin as cells.dat declares them, and its parameters read back the
    defaults that simprops.dat gives;
  - Verilator lints all timcells in one design without a warning, and
    yosys reads them;
  - the ports of both models match cells.dat (names, order, directions,
    widths; a big-ending cell's buses run from index 0 up; the timcell of
    an input pad reads its pad pin) and the models
    declare exactly the parameters of simprops.dat (the funcells without the
    timing-check switches XON and MSGON), with the same defaults in the
    funcells;
  - yosys reads all funcells and finds no problem.
Prints one line per failure and exits 1 when there is any.
"""

import json
import os
import subprocess
import sys
import xml.etree.ElementTree as ET

# No bytecode cache in the source tree.
sys.dont_write_bytecode = True
sys.path.insert(0, os.path.dirname(os.path.abspath(__file__)))
from installation import Installation, big_ending, recursive_inclusions  # noqa: E402

TIMING_SWITCHES = {"XON", "MSGON"}
failures = []


def fail(text):
    failures.append(text)
    if len(text) > 2000:
        text = text[:2000] + " ..."
    print("FAIL: " + text)


def run(cmd, cwd):
    return subprocess.run(cmd, cwd=cwd, capture_output=True, text=True)


def net_decl(pin, name):
    return f"wire [{pin.msb}:{pin.lsb}] {name};" if pin.is_bus else f"wire {name};"


def instance_text(cell, inst):
    decls = [net_decl(p, f"{inst}_{p.name}") for p in cell.pins]
    conns = ", ".join(f".{p.name}({inst}_{p.name})" for p in cell.pins)
    return decls, f"{cell.name} {inst} ({conns});"


def display_format(ptype):
    return {"HV": "%h", "BV": "%b", "I": "%0d", "S": "%0s", "F": "%f", "BL": "%0s"}[ptype]


def expected_display(ptype, default):
    if ptype in ("HV", "BV"):
        return default.split("'", 1)[1][1:].lower()
    if ptype == "I":
        return str(int(default))
    if ptype == "F":
        return "%f" % float(default)
    return default.strip('"')


def check_timcell(inst, cell, deps, work):
    """Compiles one timcell with chipwide.v and reads its parameters back."""
    decls, instance = instance_text(cell, "u")
    params = inst.simprops.get(cell.name, [])
    shows = "\n".join(f'    $display("{name}={display_format(t)}", u.{name});'
                      for name, t, _ in params)
    text = "`timescale 1 ns/1 ps\nmodule check_top;\n  " + "\n  ".join(decls)
    text += f"\n  {instance}\n  initial begin\n{shows}\n    $finish;\n  end\nendmodule\n"
    top = os.path.join(work, f"check_{cell.name}.v")
    with open(top, "w") as f:
        f.write(text)
    models = [inst.model("timcells", d) for d in deps] + [inst.model("timcells", cell.name)]
    exe = os.path.join(work, f"check_{cell.name}.vvp")
    r = run(["iverilog", "-g2005", "-gspecify", "-o", exe, "-s", "check_top", "-s", "chipwide",
             os.path.join(inst.src, "chipwide.v"), top] + models, work)
    if r.returncode != 0 or r.stderr.strip() or r.stdout.strip():
        fail(f"{cell.name}: iverilog: {(r.stdout + r.stderr).strip()}")
        return
    r = run(["vvp", "-n", exe], work)
    got = {}
    for line in r.stdout.splitlines():
        if "=" in line:
            k, v = line.split("=", 1)
            got[k] = v.strip()
    for name, ptype, default in params:
        want = expected_display(ptype, default)
        if got.get(name) != want:
            fail(f"{cell.name}: timcell parameter {name} is {got.get(name)!r}, "
                 f"simprops.dat says {default} ({want!r})")


def check_ports(cell, kind, ports, bigend):
    """ports: [(name, direction, left, right)] in port order."""
    want = []
    for p in cell.pins:
        if p.is_bus:
            if bigend is not None and cell.name.upper() in bigend and (
                    bigend[cell.name.upper()] is None or p.name.upper() in bigend[cell.name.upper()]):
                want.append((p.name, p.direction, min(p.msb, p.lsb), max(p.msb, p.lsb)))
            else:
                want.append((p.name, p.direction, p.msb, p.lsb))
        elif kind == "timcell" and p.pad and p.direction == "output":
            # An input pad's model reads its pad pin (see V_IPAD).
            want.append((p.name, "input", None, None))
        else:
            want.append((p.name, p.direction, None, None))
    if ports != want:
        fail(f"{cell.name}: {kind} ports {ports} differ from cells.dat {want}")


def verilator_ports(inst, cells, deps, work):
    """Lints all timcells in one design and returns their ports and
    parameters as Verilator elaborated them."""
    lines = ["`timescale 1 ns/1 ps", "module lint_top;", "  chipwide chipwide ();"]
    for i, cell in enumerate(cells):
        decls, instance = instance_text(cell, f"u{i}")
        lines += ["  " + d for d in decls] + ["  " + instance]
    lines.append("endmodule")
    top = os.path.join(work, "lint_top.v")
    with open(top, "w") as f:
        f.write("\n".join(lines) + "\n")
    files = [os.path.join(inst.src, "chipwide.v"), top]
    for cell in cells:
        files.append(inst.model("timcells", cell.name))
    base = ["verilator", "--timing", "--top-module", "lint_top"]
    r = run(base + ["--lint-only"] + files, work)
    if r.returncode != 0 or "%Warning" in r.stdout + r.stderr:
        fail("verilator --lint-only: " + (r.stdout + r.stderr).strip())
    r = run(["yosys", "-q", "-p", "read_verilog " + " ".join(files)], work)
    if r.returncode != 0:
        fail("yosys reading the timcells: " + (r.stdout + r.stderr).strip())
    xml = os.path.join(work, "lint_top.xml")
    r = run(base + ["--xml-only", "-Wno-fatal", "--xml-output", xml] + files, work)
    if r.returncode != 0:
        fail("verilator --xml-only: " + (r.stdout + r.stderr).strip())
        return {}
    root = ET.parse(xml).getroot()
    dtypes = {d.get("id"): d for d in root.iter("basicdtype")}
    result = {}
    for module in root.iter("module"):
        ports, params = [], []
        for var in module.findall("var"):
            d = dtypes.get(var.get("dtype_id"))
            left = d.get("left") if d is not None else None
            right = d.get("right") if d is not None else None
            rng = (int(left), int(right)) if left is not None else (None, None)
            if var.get("dir"):
                direction = var.get("dir")
                ports.append((int(var.get("pinIndex")), (var.get("name"), direction) + rng))
            elif var.get("param") == "true":
                params.append((var.get("name"), rng))
        result[module.get("origName")] = ([p for _, p in sorted(ports)], params)
    return result


def vector_width(default):
    return int(default.split("'", 1)[0])


def check_params(cell, kind, params, table, skip):
    """params: [(name, (left, right) or None)] in declaration order."""
    want = [(n, t, d) for n, t, d in table if n not in skip]
    names = [n for n, _ in params]
    if names != [n for n, _, _ in want]:
        fail(f"{cell.name}: {kind} parameters {names} differ from simprops.dat "
             f"{[n for n, _, _ in want]}")
        return
    for (name, rng), (_, ptype, default) in zip(params, want):
        if ptype in ("HV", "BV") and rng and rng[0] is not None:
            if abs(rng[0] - rng[1]) + 1 != vector_width(default):
                fail(f"{cell.name}: {kind} parameter {name} has {abs(rng[0] - rng[1]) + 1} bits, "
                     f"simprops.dat {default}")


def yosys_funcells(inst, cells, work):
    out = os.path.join(work, "funcells.json")
    files = [inst.model("funcells", c.name) for c in cells]
    r = run(["yosys", "-q", "-p",
             "read_verilog " + " ".join(files) + "; hierarchy; proc; check -assert; write_json " + out],
            work)
    if r.returncode != 0:
        fail("yosys on the funcells: " + (r.stdout + r.stderr).strip())
        return {}
    with open(out) as f:
        return json.load(f)["modules"]


def funcell_default_ok(ptype, default, value):
    if ptype in ("HV", "BV"):
        radix = 16 if ptype == "HV" else 2
        return int(value, 2) == int(default.split("'", 1)[1][1:], radix)
    if ptype == "I":
        return int(value, 2) == int(default)
    return value.rstrip() == default.strip('"')


def main():
    share, work = os.path.abspath(sys.argv[1]), os.path.abspath(sys.argv[2])
    os.makedirs(work, exist_ok=True)
    inst = Installation(share)
    deps = recursive_inclusions(inst.acd)
    bigend = big_ending(inst.acd)
    names = [c.name for c in inst.cells]
    for unknown in sorted(set(inst.simprops) - set(names)):
        fail(f"simprops.dat names {unknown}, which cells.dat does not list")
    for cell in inst.cells:
        for library in ("timcells", "funcells"):
            if not os.path.isfile(inst.model(library, cell.name)):
                fail(f"{cell.name}: no {library} model")
    if failures:
        return 1

    for cell in inst.cells:
        check_timcell(inst, cell, deps.get(cell.name.upper(), []), work)

    elaborated = verilator_ports(inst, inst.cells, deps, work)
    for cell in inst.cells:
        if cell.name not in elaborated:
            fail(f"{cell.name}: not elaborated by Verilator")
            continue
        ports, params = elaborated[cell.name]
        check_ports(cell, "timcell", ports, bigend)
        check_params(cell, "timcell", params, inst.simprops.get(cell.name, []), set())

    modules = yosys_funcells(inst, inst.cells, work)
    for cell in inst.cells:
        m = modules.get(cell.name)
        if m is None:
            continue
        ports = []
        for name, p in m["ports"].items():
            width = len(p["bits"])
            if width == 1 and not any(q.name == name and q.is_bus for q in cell.pins):
                ports.append((name, p["direction"], None, None))
            elif p.get("upto"):
                ports.append((name, p["direction"], 0, width - 1))
            else:
                ports.append((name, p["direction"], width - 1, 0))
        check_ports(cell, "funcell", ports, bigend)
        table = inst.simprops.get(cell.name, [])
        defaults = m.get("parameter_default_values", {})
        for name, ptype, default in table:
            if name in TIMING_SWITCHES:
                if name in defaults:
                    fail(f"{cell.name}: funcell declares the timing switch {name}")
                continue
            if ptype == "F":
                continue  # yosys does not list real parameters
            if name not in defaults:
                fail(f"{cell.name}: funcell lacks parameter {name}")
            elif not funcell_default_ok(ptype, default, defaults[name]):
                fail(f"{cell.name}: funcell parameter {name} defaults to {defaults[name]}, "
                     f"simprops.dat says {default}")
        listed = {n for n, _, _ in table}
        for name in defaults:
            if name not in listed:
                fail(f"{cell.name}: funcell parameter {name} is not in simprops.dat")

    print(f"cell library: {len(inst.cells)} cells, {len(failures)} failure(s)")
    return 1 if failures else 0


if __name__ == "__main__":
    sys.exit(main())
