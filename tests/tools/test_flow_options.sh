#!/usr/bin/env bash
# flow/rtl2json's parameter overrides, pin constraints and messages for
# what it or yosys rejects: each case (tests/data/flow_options/cases.txt) an
# exit code and a text the message must hold, and no netlist JSON left
# behind by a failure.
source "$(dirname "$0")/lib.sh"
cp -r "$data"/flow_options/* .
while IFS='|' read -r what want text args; do
    rm -f o.json
    read -r -a argv <<< "$args"
    check "$what: exit $want" run "$want" "$src/flow/rtl2json" "${argv[@]}"
    check "$what: '$text'" has out.txt "$text"
    [ "$want" = 0 ] || check "$what: no netlist JSON" test ! -e o.json
done < <(grep -v '^#' cases.txt)

# The override reaches the netlist (an 8-bit port), and the pads their
# locations and the ports' bits.
"$src/flow/rtl2json" -P W=8 t o.json t.v > /dev/null 2>&1
"$src/flow/rtl2json" -pins good.pins t p.json t.v > /dev/null 2>&1
check "-P W=8 gives an 8-bit port, the pads their locations" python3 - o.json p.json <<'PY'
import json, sys
width = len(json.load(open(sys.argv[1]))["modules"]["t"]["ports"]["a"]["bits"])
m = json.load(open(sys.argv[2]))["modules"]["t"]
pads = sorted((c["type"], c["attributes"]["LOC"], c["connections"]["PAD"][0] == m["ports"][p]["bits"][b])
              for c, p, b in [(m["cells"][n], p, b) for n, p, b in
                              [("pad_clk", "clk", 0), ("pad_a_0", "a", 0), ("pad_y_3", "y", 3)]])
print(width, pads)
sys.exit(width != 8 or pads != [("V_IPAD", "P1", True), ("V_IPAD", "P2", True), ("V_OPAD", "P3", True)])
PY
finish
