#!/usr/bin/env bash
# Netlists that mean what the design means, or a clear error: designs built
# by yosys from small RTL and hand-made ones (tests/data/faithful) whose
# netlists Icarus Verilog and Verilator must accept and, where the meaning is
# at stake, yosys must prove equivalent to the RTL or to the design file;
# faulty inputs and installations must end with one clear message and the
# documented exit code.
source "$(dirname "$0")/lib.sh"
here=$data/faithful
q="$bin/qdb2ver -w -insert_chipwide false"
generic() {  # rtl out.json: yosys's own gates and lookup tables
    yosys -q -p "read_verilog $1; synth -top top -lut 4; write_json $2"
}

# --- Meaning: constants of named nets, parameters in both forms ----------
generic "$here/const_reg.v" const_reg.json
for variant in plain:"" defparam:NLW_VERILOG_DEFPARM=1 old_pfd:NLW_OLD_PFD=1 flat:-fn; do
    name=${variant%%:*} opt=${variant#*:} env=() args=()
    case $opt in -*) args=("$opt") ;; ?*) env=("$opt") ;; esac
    net="const_reg.$name.v"
    check "const_reg/$name: written" run 0 env "${env[@]}" $q "${args[@]}" const_reg.json "$net"
    check "const_reg/$name: compiles" compiles "$net" top $sim
    check "const_reg/$name: constant bit assigned" has "$net" "r[2] = 1'b1"
    check "const_reg/$name: equivalent to the design" prove const_reg.json "$net" top
    check "const_reg/$name: equivalent to the RTL" prove "$here/const_reg.v" "$net" top
done
check "defparam: lookup tables keep their parameters" has const_reg.defparam.v ".WIDTH = "

"$src/flow/rtl2json" top pfd.json "$here/pfd_cells.v" > /dev/null
for env in "" NLW_OLD_PFD NLW_VERILOG_DEFPARM; do
    net="pfd.${env:-plain}.v"
    check "library cells ${env:-plain}: written" run 0 env ${env:+$env=1} $q pfd.json "$net"
    check "library cells ${env:-plain}: no literal inside a literal" lacks "$net" "'h4'h"
    check "library cells ${env:-plain}: compiles" compiles "$net" top "$funcells"/*.v
    check "library cells ${env:-plain}: equivalent to the RTL" prove "$here/pfd_cells.v" "$net" top
done
check "output buffer with an x input keeps the pin" has pfd.plain.v ".I(1'bx)"

# --- Open and constant bits of outputs, inputs tied inside ---------------
# open_outputs.json: open_outputs.v through yosys (synth -lut 4), with the
# bits other flows leave open or constant, which yosys does not write: the
# sub-module's outputs open in part (y) or whole (z), an input bit tied
# inside it, a cell output tied to a constant. The gold design has fresh
# nets on the open and constant cell outputs, which is what they mean.
cp "$here/open_outputs.json" oo.json
cp "$here/open_outputs_gold.json" oo_gold.json
for opts in "" "-fn" "-ne"; do
    net="oo$opts.v"
    check "open bits $opts: written" run 0 $q $opts oo.json "$net"
    check "open bits $opts: compiles" compiles "$net" top $sim
    check "open bits $opts: no constant on an output" lacks "$net" "1'bz"
    check "open bits $opts: no constant assigned" lacks "$net" "1'b0 ="
    check "open bits $opts: equivalent to the design" prove oo_gold.json "$net" top
done

# --- Names ------------------------------------------------------------------
generic "$here/odd_names.v" odd.json
check "odd names: written" run 0 $q odd.json odd.v
check "odd names: compiles" compiles odd.v top $sim
check "odd names: ports as the RTL names them" has odd.v "input \\1st ;"
check "odd names: equivalent to the RTL" prove "$here/odd_names.v" odd.v top
check "odd names: no backtick" lacks odd.v '`tick'

# Names that break tools: black-box module and pin names, library pin
# names, names of 300 000 characters of every kind, empty names, a module
# named chipwide; the black boxes as their legal names declare them.
python3 -c 'import sys; print(open(sys.argv[1]).read().replace("@LONG@", "n" * 300000))' \
    "$here/names.json.in" > names.json
sed 's/\\endmodule /endmodule_1/' "$here/stubs.v" > stubs-ne.v
for opts in "" "-ne" "-insert_chipwide true"; do
    net="names$opts.v"
    stubs="$here/stubs.v"
    [ "$opts" = -ne ] && stubs=stubs-ne.v
    check "names $opts: written" run 1 $q $opts names.json "$net"
    check "names $opts: parameter names that cannot be written" \
        test "$(grep -c 'is no Verilog identifier' out.txt)" = 2
    check "names $opts: compiles" compiles "$net" top "$stubs" $sim
    check "names $opts: no line of 300 000 characters" awk 'length($0) > 5000 { exit 1 }' "$net"
done
check "-tm chipwide is refused" run 2 $q -tm chipwide names.json tm.v
check "-tm '' is refused" run 2 $q -tm "" names.json tm.v
check "-ti '' is refused" run 2 "$bin/qdb2ver" -w -tf -ti "" names.json tm.v

# --- Parameters: names in another case than the model's, two names of one
# model parameter; values no number of the radix they claim ----------------
check "parameter names: written" run 0 "$bin/qdb2ver" -w -ism "$here/param_names.json" pn.v
check "parameter names: the model's spelling" has pn.v ".INIT ( 16'h6996 )"
check "parameter names: one INIT per flip-flop" test "$(grep -c '\.INIT' pn.v)" = 2
check "parameter names: compiles with the models" iverilog -g2005 -o a.out -s top -s chipwide pn.v
k=0
for value in NaN xyz "1 2" -1; do
    check "bad INIT '$value': error" run 1 $q "$here/badinit_$k.json" bi.v
    check "bad INIT '$value': names instance, parameter, value" \
        has out.txt "Instance 'lut': parameter INIT has the value \"$value\""
    k=$((k + 1))
done

# --- Clock manager attributes in the translation file ------------------------
"$src/flow/rtl2json" top dcm.json "$here/dcm_attrs.v" > /dev/null
check "clock manager: written" run 0 "$bin/tessel" -sta -w dcm.json dcm.v
for attr in CLKFX_DIVIDE=2 CLKFX_MULTIPLY=5 PHASE_SHIFT=-5 CLKIN_PERIOD=20 CLKDV_DIVIDE=3.0 \
    DSS_MODE=NONE; do
    check "clock manager: $attr" has dcm.pcs "ATTRIB|$attr;"
done

# --- Faulty inputs: exit 2, one message naming file and object, no file ------
for bad in "$here"/bad_*.json; do
    name=$(basename "$bad" .json)
    echo "old" > keep.v
    check "$name: exit 2" run 2 $q "$bad" keep.v
    check "$name: the message names the file" has out.txt "$name.json: "
    check "$name: the old netlist stays" test "$(cat keep.v)" = old
done

# --- -ism without a usable installation -------------------------------------
mkdir -p empty/data
for root in "$work/none" /etc/passwd "$work/empty"; do
    check "-ism with VORNIX=$root: exit 1" run 1 env VORNIX="$root" $q -ism pfd.json ism.v
    check "-ism with VORNIX=$root: says so" has out.txt "The cell models could not be found"
done
finish
