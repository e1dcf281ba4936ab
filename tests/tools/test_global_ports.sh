#!/usr/bin/env bash
# -gp and -tp: the global set/reset and tristate come out as top-level ports;
# the netlist and its test fixture run in Icarus, and the ports reset every
# flop and float every output buffer.
source "$(dirname "$0")/lib.sh"
check "rtl2json maps the design" "$src/flow/rtl2json" gd gd.json "$data/options/global_ports.v"
check "tessel -gp -tp" "$bin/tessel" -sim -gp GSR_PORT -tp GTS_PORT -tb -ism -w gd.json
for line in "input GSR_PORT;" "input GTS_PORT;" "assign chipwide.GSR = GSR_PORT;" \
    "assign chipwide.GTS = GTS_PORT;"; do
    check "the netlist has '$line'" has gd.v "$line"
done
check "iverilog compiles netlist and fixture" iverilog -g2005 -o fixture.vvp -s test -s chipwide gd.v gd.tv
check "the fixture runs" vvp -n fixture.vvp
check "the fixture drives the port" has gd.tv "GSR_PORT = 1;"
check "the ports reset the flops and float the outputs" eval "iverilog -g2005 -o bench.vvp -s bench -s chipwide \
    gd.v '$data/options/global_ports_tb.v' && vvp -n bench.vvp | tee bench.txt && grep -qx PASS bench.txt"
finish
