#!/usr/bin/env bash
# -gp and -tp: the global set/reset and tristate come out as top-level ports;
# the netlist and its test fixture run in Icarus, and the ports reset every
# flop and float every output buffer.
set -uo pipefail
src=${NLW_SRC:-$(cd "$(dirname "$0")/../.." && pwd)}
bin=${NLW_BIN:-$src/build}
data=$src/tests/data/options
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
fail=0
step() {  # description command...
    local what=$1; shift
    if "$@" >"$work/out.txt" 2>&1; then echo "ok   $what"; else
        echo "FAIL $what"; head -30 "$work/out.txt"; fail=1; fi
}

step "rtl2json maps the design" "$src/flow/rtl2json" gd "$work/gd.json" "$data/global_ports.v"
step "tessel -gp -tp" "$bin/tessel" -sim -gp GSR_PORT -tp GTS_PORT -tb -ism -w "$work/gd.json"
for line in "input GSR_PORT;" "input GTS_PORT;" "assign chipwide.GSR = GSR_PORT;" \
    "assign chipwide.GTS = GTS_PORT;"; do
    step "the netlist has '$line'" grep -qF -- "$line" "$work/gd.v"
done
step "iverilog compiles netlist and fixture" iverilog -g2005 -o "$work/fixture.vvp" -s test \
    -s chipwide "$work/gd.v" "$work/gd.tv"
step "the fixture runs" vvp -n "$work/fixture.vvp"
step "the fixture drives the port" grep -qF "GSR_PORT = 1;" "$work/gd.tv"
step "iverilog compiles netlist and bench" iverilog -g2005 -o "$work/bench.vvp" -s bench \
    -s chipwide "$work/gd.v" "$data/global_ports_tb.v"
vvp -n "$work/bench.vvp" >"$work/bench.txt" 2>&1
if grep -qx PASS "$work/bench.txt"; then echo "ok   the ports reset the flops and float the outputs"; else
    echo "FAIL the bench"; cat "$work/bench.txt"; fail=1; fi
exit $fail
