#!/usr/bin/env bash
# A design whose module, cell and net names are hostile to Verilog tools
# (tests/data/hostile/hostile.json: blanks, brackets, backslashes, quotes,
# dots, slashes, '$', leading digits, keywords of every Verilog and
# SystemVerilog standard, bytes above 127, 3000-character names, names
# differing only in case or colliding once legalized, bus members beside
# scalars of their base name) gives netlists that Icarus Verilog (2005 and
# 2012), Verilator and yosys accept, with and without escaped names, and
# that yosys proves equivalent to the same design under plain names
# (gold.json; the ports keep theirs): no connection lost, none merged.
# Without the legalizer names are only escaped as they are written.
source "$(dirname "$0")/lib.sh"
cp "$data/hostile/hostile.json" "$data/hostile/gold.json" .
for variant in "escaped:-aka" "plain:-ne -aka"; do
    net="${variant%%:*}.v"
    check "$net: qdb2ver" "$bin/qdb2ver" -w -insert_chipwide false ${variant#*:} hostile.json "$net"
    check "$net: iverilog -g2012" iverilog -g2012 -o a.out -s top "$net" $sim
    accepted "$net" "$net" top gold.json
done
check "without the name cache: qdb2ver" env NLW_NO_NAMECACHE= "$bin/qdb2ver" -w -insert_chipwide false hostile.json nocache.v
finish
