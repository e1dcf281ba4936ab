#!/usr/bin/env bash
# Netlists written from yosys's generic gate and lookup-table mappings of
# small RTL designs are accepted by Icarus Verilog, Verilator and yosys, and
# yosys proves each equivalent to its RTL (with and without escaped names,
# and flattened).
source "$(dirname "$0")/lib.sh"
for rtl in "$data"/generic/*.v; do
    top=$(basename "$rtl" .v)
    for flavour in gates:"" lut4:"-lut 4"; do
        json="$top.${flavour%%:*}.json"
        check "$top: yosys synth ${flavour#*:}" yosys -q -p "read_verilog $rtl; synth -top $top ${flavour#*:}; write_json $json"
        for names in escaped:"" plain:-ne flat:-fn; do
            net="$top.${flavour%%:*}.${names%%:*}.v"
            check "$net: qdb2ver" "$bin/qdb2ver" -w -insert_chipwide false ${names#*:} "$json" "$net"
            accepted "$net" "$net" "$top" "$rtl"
        done
    done
done
finish
