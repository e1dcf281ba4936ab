#!/usr/bin/env python3
"""Lists the timing models a netlist JSON instantiates, each once, models
named by RecursiveInclusion before the cell that needs them.

usage: model_files.py SHARE_DIR DESIGN.json
"""

import json
import os
import sys

# No bytecode cache in the source tree.
sys.dont_write_bytecode = True
sys.path.insert(0, os.path.dirname(os.path.abspath(__file__)))
from installation import Installation, recursive_inclusions  # noqa: E402


def main():
    inst = Installation(sys.argv[1])
    deps = recursive_inclusions(inst.acd)
    known = {c.name for c in inst.cells}
    with open(sys.argv[2]) as f:
        modules = json.load(f)["modules"]
    done = set()
    for name, module in modules.items():
        if module.get("attributes", {}).get("blackbox"):
            continue
        for cell in module["cells"].values():
            if cell["type"] not in known:
                continue
            for model in deps.get(cell["type"].upper(), []) + [cell["type"]]:
                if model not in done:
                    done.add(model)
                    print(inst.model("timcells", model))


if __name__ == "__main__":
    main()
