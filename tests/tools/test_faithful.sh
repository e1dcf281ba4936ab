#!/usr/bin/env bash
# Netlists that mean what the design means, or a clear error: designs built
# by yosys from small RTL (tests/tools/faithful) and hand-made ones
# (faithful/cases.py) whose netlists Icarus Verilog and Verilator must accept
# and, where the meaning is at stake, yosys must prove equivalent to the RTL
# or to the design file; faulty inputs and installations must end with one
# clear message and the documented exit code.
set -uo pipefail
src=${NLW_SRC:-$(cd "$(dirname "$0")/../.." && pwd)}
bin=${NLW_BIN:-$src/build}
here="$src/tests/tools/faithful"
funcells="$src/share/verilog/src/funcells"
datdir=${YOSYS_DATDIR:-/usr/share/yosys}
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
export NLW_TIMESTAMP=${NLW_TIMESTAMP:-"Thu Jan  1 00:00:00 2026"}
unset VORNIX NLW_VERILOG_DEFPARM NLW_OLD_PFD
fail=0

check() {  # name command...
    local name=$1; shift
    if "$@" >"$work/log.txt" 2>&1; then echo "ok   $name"; else
        echo "FAIL $name"; sed -n '1,30p' "$work/log.txt" | cut -c1-300; fail=1; fi
}
has() {  # file text: the file holds the text
    grep -qF -- "$2" "$1"
}
lacks() {
    ! grep -qF -- "$2" "$1"
}
# Icarus and Verilator accept the netlist with the given model files.
compiles() {  # netlist top models...
    local net=$1 top=$2; shift 2
    iverilog -g2005 -o "$work/a.out" -s "$top" "$net" "$@" &&
        verilator --lint-only -Wno-fatal -Wno-lint -Wno-style --top-module "$top" "$net" "$@"
}
# yosys proves the netlist equivalent to the gold design: RTL (.v) or a
# design file (.json). Library cells are read with their functional models.
prove() {  # gold netlist top
    local read_gold="read_verilog $1"
    case $1 in *.json) read_gold="read_json $1" ;; esac
    yosys -q -p "
        read_verilog -lib $funcells/*.v; $read_gold; hierarchy -top $3; proc;
        setattr -mod -unset keep_hierarchy; flatten;
        async2sync; opt_clean; rename $3 gold; design -stash gold;
        read_verilog $2; read_verilog $funcells/*.v;
        read_verilog -noblackbox -DSIMLIB_NOCHECKS +/simcells.v +/simlib.v;
        hierarchy -top $3; proc; flatten; async2sync; opt_clean; rename $3 gate;
        design -stash gate;
        design -copy-from gold -as gold gold; design -copy-from gate -as gate gate;
        equiv_make gold gate equiv; hierarchy -top equiv;
        equiv_simple -seq 4; equiv_induct -seq 4; equiv_status -assert"
}
run() {  # expected-exit command...: the exit code and what was said
    local want=$1; shift
    "$@" >"$work/out.txt" 2>&1
    local got=$?
    [ "$got" = "$want" ] || { echo "exit $got, expected $want"; cat "$work/out.txt"; return 1; }
}
generic() {  # rtl out.json: yosys's own gates and lookup tables
    yosys -q -p "read_verilog $1; synth -top top -lut 4; write_json $2"
}
sim="$datdir/simcells.v $datdir/simlib.v"
q="$bin/qdb2ver -w -insert_chipwide false"

# --- Meaning: constants of named nets, parameters in both forms ----------
generic "$here/const_reg.v" "$work/const_reg.json"
for variant in plain:"" defparam:NLW_VERILOG_DEFPARM old_pfd:NLW_OLD_PFD flat:-fn; do
    name=${variant%%:*} opt=${variant#*:}
    net="$work/const_reg.$name.v"
    if [ "$opt" = -fn ]; then
        check "const_reg/$name: written" run 0 $q -fn "$work/const_reg.json" "$net"
    else
        check "const_reg/$name: written" run 0 env ${opt:+$opt=} $q "$work/const_reg.json" "$net"
    fi
    check "const_reg/$name: compiles" compiles "$net" top $sim
    check "const_reg/$name: constant bit assigned" has "$net" "r[2] = 1'b1"
    check "const_reg/$name: equivalent to the design" prove "$work/const_reg.json" "$net" top
    check "const_reg/$name: equivalent to the RTL" prove "$here/const_reg.v" "$net" top
done
check "defparam: lookup tables keep their parameters" has "$work/const_reg.defparam.v" ".WIDTH = "

"$src/flow/rtl2json" top "$work/pfd.json" "$here/pfd_cells.v" >/dev/null
for env in "" NLW_OLD_PFD NLW_VERILOG_DEFPARM; do
    net="$work/pfd.${env:-plain}.v"
    check "library cells ${env:-plain}: written" run 0 env ${env:+$env=} $q "$work/pfd.json" "$net"
    check "library cells ${env:-plain}: no literal inside a literal" lacks "$net" "'h4'h"
    check "library cells ${env:-plain}: compiles" compiles "$net" top "$funcells"/*.v
    check "library cells ${env:-plain}: equivalent to the RTL" prove "$here/pfd_cells.v" "$net" top
done
check "output buffer with an x input keeps the pin" has "$work/pfd.plain.v" ".I(1'bx)"

# --- Open and constant bits of outputs, inputs tied inside ---------------
generic "$here/open_outputs.v" "$work/oo_base.json"
python3 "$here/cases.py" open "$work/oo_base.json" "$work/oo.json" "$work/oo_gold.json"
for opts in "" "-fn" "-ne"; do
    net="$work/oo$opts.v"
    check "open bits $opts: written" run 0 $q $opts "$work/oo.json" "$net"
    check "open bits $opts: compiles" compiles "$net" top $sim
    check "open bits $opts: no constant on an output" lacks "$net" "1'bz"
    check "open bits $opts: no constant assigned" lacks "$net" "1'b0 ="
    check "open bits $opts: equivalent to the design" prove "$work/oo_gold.json" "$net" top
done

# --- Names ------------------------------------------------------------------
generic "$here/odd_names.v" "$work/odd.json"
check "odd names: written" run 0 $q "$work/odd.json" "$work/odd.v"
check "odd names: compiles" compiles "$work/odd.v" top $sim
check "odd names: ports as the RTL names them" has "$work/odd.v" "input \\1st ;"
check "odd names: equivalent to the RTL" prove "$here/odd_names.v" "$work/odd.v" top
check "odd names: no backtick" lacks "$work/odd.v" '`tick'

python3 "$here/cases.py" gen "$work"
# The black boxes as their legal names declare them.
cat > "$work/stubs.v" <<'V'
module my_cell(input A_b, output \endmodule , output unnamed);
  parameter \a-b  = 0;
endmodule
module unnamed(input A, output Y); assign Y = A; endmodule
V
sed 's/\\endmodule /endmodule_1/' "$work/stubs.v" >"$work/stubs-ne.v"
for opts in "" "-ne" "-insert_chipwide true"; do
    net="$work/names$opts.v"
    stubs="$work/stubs.v"
    [ "$opts" = -ne ] && stubs="$work/stubs-ne.v"
    check "names $opts: written" run 1 $q $opts "$work/names.json" "$net"
    check "names $opts: parameter names that cannot be written" \
        test "$(grep -c 'is no Verilog identifier' "$work/out.txt")" = 2
    check "names $opts: compiles" compiles "$net" top "$stubs" $sim
    check "names $opts: no line of 300 000 characters" \
        awk 'length($0) > 5000 { exit 1 }' "$net"
done
check "-tm chipwide is refused" run 2 $q -tm chipwide "$work/names.json" "$work/tm.v"
check "-tm '' is refused" run 2 $q -tm "" "$work/names.json" "$work/tm.v"
check "-ti '' is refused" run 2 "$bin/qdb2ver" -w -tf -ti "" "$work/names.json" "$work/tm.v"

# --- Parameters -------------------------------------------------------------
check "parameter names: written" run 0 "$bin/qdb2ver" -w -ism "$work/param_names.json" "$work/pn.v"
check "parameter names: the model's spelling" has "$work/pn.v" ".INIT ( 16'h6996 )"
check "parameter names: one INIT per flip-flop" \
    test "$(grep -c '\.INIT' "$work/pn.v")" = 2
check "parameter names: compiles with the models" \
    iverilog -g2005 -o "$work/a.out" -s top -s chipwide "$work/pn.v"
for k in 0 1 2 3; do
    value=$(python3 -c "print(['NaN', 'xyz', '1 2', '-1'][$k])")
    check "bad INIT '$value': error" run 1 $q "$work/badinit_$k.json" "$work/bi.v"
    check "bad INIT '$value': names instance, parameter, value" \
        has "$work/out.txt" "Instance 'lut': parameter INIT has the value \"$value\""
done

# --- Clock manager attributes in the translation file ------------------------
"$src/flow/rtl2json" top "$work/dcm.json" "$here/dcm_attrs.v" >/dev/null
check "clock manager: written" run 0 "$bin/tessel" -sta -w "$work/dcm.json" "$work/dcm.v"
for attr in CLKFX_DIVIDE=2 CLKFX_MULTIPLY=5 PHASE_SHIFT=-5 CLKIN_PERIOD=20 CLKDV_DIVIDE=3.0 \
    DSS_MODE=NONE; do
    check "clock manager: $attr" has "$work/dcm.pcs" "ATTRIB|$attr;"
done

# --- Faulty inputs: exit 2, one message naming file and object, no file ------
for bad in "$work"/bad_*.json; do
    name=$(basename "$bad" .json)
    echo "old" >"$work/keep.v"
    check "$name: exit 2" run 2 $q "$bad" "$work/keep.v"
    check "$name: the message names the file" has "$work/out.txt" "$name.json: "
    check "$name: the old netlist stays" test "$(cat "$work/keep.v")" = old
done

# --- -ism without a usable installation -------------------------------------
mkdir -p "$work/empty/data"
for root in "$work/none" /etc/passwd "$work/empty"; do
    check "-ism with VORNIX=$root: exit 1" run 1 env VORNIX="$root" $q -ism "$work/pfd.json" "$work/ism.v"
    check "-ism with VORNIX=$root: says so" has "$work/out.txt" "The cell models could not be found"
done
exit $fail
