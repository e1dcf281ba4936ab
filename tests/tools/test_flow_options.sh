#!/usr/bin/env bash
# flow/rtl2json's parameter overrides, pin constraints and messages for
# what it or yosys rejects: each case an exit code and a text the message
# must hold, and no netlist JSON left behind by a failure.
set -uo pipefail
src=$(cd "${NLW_SRC:-$(dirname "$0")/../..}" && pwd)
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
cd "$work" || exit 1
fail=0

cat > t.v <<'V'
module t #(parameter W = 4, parameter M = "A") (input clk, input [W-1:0] a, output reg [W-1:0] y);
  always @(posedge clk) y <= (M == "B") ? a : ~a;
endmodule
V
printf 'module t(input a, output y);\n  assign y = a +;\nendmodule\n' > syntax.v
printf 'module t(input a, output y);\n  sub u(.a(a), .y(y));\nendmodule\n' > missing.v
mkdir -p inc
printf '`define INV ~\n' > inc/defs.vh
printf '`include "defs.vh"\nmodule two(input a, output y);\n  leaf u(.a(a), .y(y));\nendmodule\n' > two.v
printf '`include "defs.vh"\nmodule leaf(input a, output y);\n  assign y = `INV a;\nendmodule\n' > leaf.v
printf 'clk P1\na[0] P2\ny[3] P3  # the top bit\n' > good.pins
printf 'clk P1\nclock P2\n' > noport.pins
printf 'a P1\n' > bus.pins
printf 'a[4] P1\n' > range.pins
printf 'clk P1\na[0] P1\n' > twoloc.pins
printf 'clk P1 extra\n' > words.pins

# description | exit code | text in the message | rtl2json arguments
cases=(
    "parameter override|0|wrote 'o.json'|-P W=8 -P M=B t o.json t.v"
    "pin constraints|0|wrote 'o.json'|-P W=4 -pins good.pins t o.json t.v"
    "two files, an include folder|0|wrote 'o.json'|-I inc two o.json two.v leaf.v"
    "include folder missing|1|cannot find the include file 'defs.vh' (give its folder with -I)|two o.json two.v leaf.v"
    "unknown parameter|1|module 't' has no parameter 'NOPE'|-P NOPE=3 t o.json t.v"
    "bad -P|2|-P takes NAME=VALUE|-P W t o.json t.v"
    "syntax error|1|rtl2json: syntax.v:2: syntax error|t o.json syntax.v"
    "missing module|1|module 'sub' (instance 'u' in module 't') is in none of the RTL files|t o.json missing.v"
    "unknown top|1|no module 'nope' in the RTL files|nope o.json t.v"
    "unknown port|1|noport.pins:2: module 't' has no port 'clock'|-pins noport.pins t o.json t.v"
    "bus without bit|1|bus.pins:1: port 'a' is a bus|-pins bus.pins t o.json t.v"
    "bit out of range|1|range.pins:1: port 'a' has no bit 4 (its bits are 0 to 3)|-pins range.pins t o.json t.v"
    "location twice|1|twoloc.pins:2: location 'P1' is given twice (first on line 1)|-pins twoloc.pins t o.json t.v"
    "extra words|1|words.pins:1: expected 'PORT LOCATION'|-pins words.pins t o.json t.v"
    "no pins file|1|cannot read the pin constraints 'none.pins'|-pins none.pins t o.json t.v"
)
for c in "${cases[@]}"; do
    IFS='|' read -r what want text args <<< "$c"
    rm -f o.json
    read -r -a argv <<< "$args"
    "$src/flow/rtl2json" "${argv[@]}" > out.txt 2>&1
    got=$?
    if [ "$got" != "$want" ]; then
        echo "FAIL $what: exit $got, expected $want"; sed 's/^/    /' out.txt; fail=1
    elif ! grep -qF -- "$text" out.txt; then
        echo "FAIL $what: '$text' not in the output"; sed 's/^/    /' out.txt; fail=1
    elif [ "$want" != 0 ] && [ -e o.json ]; then
        echo "FAIL $what: a netlist JSON was written"; fail=1
    else
        echo "ok   $what"
    fi
done

# The override reaches the netlist (an 8-bit port), and the pads their
# locations and the ports' bits.
"$src/flow/rtl2json" -P W=8 t o.json t.v > /dev/null 2>&1
"$src/flow/rtl2json" -pins good.pins t p.json t.v > /dev/null 2>&1
python3 - o.json p.json <<'PY' || fail=1
import json, sys
width = len(json.load(open(sys.argv[1]))["modules"]["t"]["ports"]["a"]["bits"])
m = json.load(open(sys.argv[2]))["modules"]["t"]
pads = sorted((c["type"], c["attributes"]["LOC"], c["connections"]["PAD"][0] == m["ports"][p]["bits"][b])
              for c, p, b in [(m["cells"][n], p, b) for n, p, b in
                              [("pad_clk", "clk", 0), ("pad_a_0", "a", 0), ("pad_y_3", "y", 3)]])
want = [("V_IPAD", "P1", True), ("V_IPAD", "P2", True), ("V_OPAD", "P3", True)]
print(("ok  " if width == 8 else "FAIL") + f" -P W=8 gives an {width}-bit port")
print(("ok  " if pads == want else "FAIL") + f" pads {pads}")
sys.exit(0 if width == 8 and pads == want else 1)
PY
exit $fail
