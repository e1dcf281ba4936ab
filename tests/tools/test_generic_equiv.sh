#!/usr/bin/env bash
# Netlists written from yosys's generic gate and lookup-table mappings of
# small RTL designs are accepted by Icarus Verilog, Verilator and yosys, and
# yosys proves each equivalent to its RTL (with and without escaped names,
# and flattened).
set -uo pipefail
src=${NLW_SRC:-$(cd "$(dirname "$0")/../.." && pwd)}
bin=${NLW_BIN:-$src/build}
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
datdir=${YOSYS_DATDIR:-/usr/share/yosys}
fail=0

check() {  # name command...: runs a check and reports it
    local name=$1; shift
    if "$@" >"$work/log.txt" 2>&1; then
        echo "ok   $name"
    else
        echo "FAIL $name"; sed -n '1,40p' "$work/log.txt"; fail=1
    fi
}

prove() {  # rtl netlist top
    yosys -q -p "
        read_verilog $1; prep -top $3; flatten; async2sync; design -stash gold;
        read_verilog $2; read_verilog -noblackbox -DSIMLIB_NOCHECKS +/simcells.v +/simlib.v;
        hierarchy -top $3; proc; flatten; async2sync; opt_clean; design -stash gate;
        design -copy-from gold -as gold $3; design -copy-from gate -as gate $3;
        equiv_make gold gate equiv; hierarchy -top equiv;
        equiv_simple -seq 4; equiv_induct -seq 4; equiv_status -assert"
}

lint() {  # netlist top
    verilator --lint-only -Wno-fatal -Wno-lint -Wno-style --top-module "$2" "$1" \
        "$datdir/simcells.v" "$datdir/simlib.v"
}

for rtl in "$src"/tests/data/generic/*.v; do
    top=$(basename "$rtl" .v)
    for flavour in gates lut4; do
        script="read_verilog $rtl; synth -top $top"
        [ $flavour = lut4 ] && script="$script -lut 4"
        json="$work/$top.$flavour.json"
        yosys -q -p "$script; write_json $json" || { echo "FAIL yosys synth $top"; fail=1; continue; }
        for names in escaped plain flat; do
            opts="-w -insert_chipwide false"
            [ $names = plain ] && opts="$opts -ne"
            [ $names = flat ] && opts="$opts -fn"
            net="$work/$top.$flavour.$names.v"
            tag="$top/$flavour/$names"
            check "$tag: qdb2ver" "$bin/qdb2ver" $opts "$json" "$net"
            check "$tag: iverilog" iverilog -g2005 -o "$work/a.out" -s "$top" "$net" \
                "$datdir/simcells.v" "$datdir/simlib.v"
            check "$tag: verilator" lint "$net" "$top"
            check "$tag: yosys read" yosys -q -p "read_verilog $net; hierarchy -top $top"
            check "$tag: equivalent" prove "$rtl" "$net" "$top"
        done
    done
done
exit $fail
