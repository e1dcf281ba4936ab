#!/usr/bin/env bash
# Designs with hostile names give netlists that Icarus Verilog, Verilator and
# yosys accept, with and without escaped names, and that yosys proves
# equivalent to the same design under plain names: no connection lost, none
# merged.
set -uo pipefail
src=${NLW_SRC:-$(cd "$(dirname "$0")/../.." && pwd)}
bin=${NLW_BIN:-$src/build}
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
datdir=${YOSYS_DATDIR:-/usr/share/yosys}
fail=0

check() {
    local name=$1; shift
    if "$@" >"$work/log.txt" 2>&1; then echo "ok   $name"; else
        echo "FAIL $name"; sed -n '1,30p' "$work/log.txt" | cut -c1-300; fail=1; fi
}

prove() {  # gold.json netlist
    yosys -q -p "
        read_json $1; hierarchy -top top; flatten; design -stash gold;
        read_verilog $2; read_verilog -noblackbox +/simcells.v;
        hierarchy -top top; proc; flatten; opt_clean; design -stash gate;
        design -copy-from gold -as gold top; design -copy-from gate -as gate top;
        equiv_make gold gate equiv; hierarchy -top equiv;
        equiv_simple -seq 2; equiv_induct -seq 2; equiv_status -assert"
}

python3 "$src/tests/tools/hostile/gen_hostile.py" "$work/hostile.json" "$work/gold.json"
for variant in "escaped:-aka" "plain:-ne -aka" "escaped-nocache:"; do
    name=${variant%%:*}
    opts=${variant#*:}
    net="$work/$name.v"
    if [ "$name" = escaped-nocache ]; then
        # Without the legalizer names are only escaped as they are written.
        check "$name: qdb2ver" env NLW_NO_NAMECACHE= "$bin/qdb2ver" -w -insert_chipwide false "$work/hostile.json" "$net"
        continue
    fi
    check "$name: qdb2ver" "$bin/qdb2ver" -w -insert_chipwide false $opts "$work/hostile.json" "$net"
    check "$name: iverilog" iverilog -g2005 -o "$work/a.out" -s top "$net" "$datdir/simcells.v"
    check "$name: iverilog -g2012" iverilog -g2012 -o "$work/a.out" -s top "$net" "$datdir/simcells.v"
    check "$name: verilator" verilator --lint-only -Wno-fatal -Wno-lint -Wno-style --top-module top "$net" "$datdir/simcells.v"
    check "$name: yosys read" yosys -q -p "read_verilog $net; hierarchy -top top"
    check "$name: equivalent" prove "$work/gold.json" "$net"
done
exit $fail
