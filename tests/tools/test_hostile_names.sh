#!/usr/bin/env bash
# Designs with hostile names give netlists that Icarus Verilog (2005 and
# 2012), Verilator and yosys accept, with and without escaped names, and
# that yosys proves equivalent to the same design under plain names: no
# connection lost, none merged. Without the legalizer names are only
# escaped as they are written.
source "$(dirname "$0")/lib.sh"
python3 "$tools/hostile/gen_hostile.py" hostile.json gold.json
for variant in "escaped:-aka" "plain:-ne -aka"; do
    net="${variant%%:*}.v"
    check "$net: qdb2ver" "$bin/qdb2ver" -w -insert_chipwide false ${variant#*:} hostile.json "$net"
    check "$net: iverilog -g2012" iverilog -g2012 -o a.out -s top "$net" $sim
    accepted "$net" "$net" top gold.json
done
check "without the name cache: qdb2ver" env NLW_NO_NAMECACHE= "$bin/qdb2ver" -w -insert_chipwide false hostile.json nocache.v
finish
