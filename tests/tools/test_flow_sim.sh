#!/usr/bin/env bash
# End-to-end checks of the default installation, the RTL flow and qdb2ver:
#
#  1. the cell library agrees with the installation's data files, compiles
#     with Icarus Verilog and passes Verilator's lint (lib/cells.py check);
#     the timing and functional models behave alike (lib/cells.py compare);
#     the timing models pass directed checks (tests/data/cells_directed_tb.v);
#  2. every design under tests/data/designs/, and the committed example, goes
#     RTL -> flow/rtl2json -> qdb2ver -ism -> one netlist file that Icarus
#     compiles on its own; a random-stimulus bench gives the same outputs,
#     cycle by cycle, on the RTL and on the netlist; Verilator lints the
#     netlist without a warning (docs/flow.md); yosys proves the netlist
#     (read with the functional models) equivalent to the RTL; a design's
#     top-level parameter overrides and pin constraints go through the
#     flow, and the pin map lists every constrained port; below the top the
#     flow's nets are single bits, buses with -keepbuses;
#  3. qdb2ver's installation lookups: models and the chipwide module found
#     along a list of installation roots, and the messages for missing ones.
#
# Options: --yosys-netlist checks yosys's own netlist writer instead of
# qdb2ver (parts 1 and 2 only); --keep keeps the work directory; further
# arguments name the designs to check (default: all).
yosys_netlist=0 only=()
for arg in "$@"; do
    case "$arg" in
    --yosys-netlist) yosys_netlist=1 ;;
    --keep) export KEEP=1 ;;
    -*) echo "usage: $0 [--yosys-netlist] [--keep] [design...]" >&2 && exit 2 ;;
    *) only+=("$arg") ;;
    esac
done
source "$(dirname "$0")/lib.sh"
timcells=$share/verilog/src/timcells
chipwide=$share/verilog/src/chipwide.v
qdb2ver=$bin/qdb2ver

# ---------------------------------------------------------------------------
# 1. The cell library.
check "cell library" python3 "$tools/lib/cells.py" check "$share" cells
check "timing and functional models alike" python3 "$tools/lib/cells.py" compare "$share" models
check "directed checks of the timing models" eval "iverilog -g2005 -gspecify -o directed.vvp \
    -s cells_directed_tb -s chipwide -y $timcells $data/cells_directed_tb.v $chipwide &&
    vvp -n directed.vvp | tee directed.log && grep -q '^directed: [0-9]* checks, 0 failures' directed.log"

# ---------------------------------------------------------------------------
# 2. Designs through the flow, simulation and proof.

# All values of the directive NAME in FILE's comments ("// nlw-test: NAME ..."), one a line.
directives() { sed -n "s|^// nlw-test: $2 *\(.*\)\$|\1|p" "$1"; }

# The netlist file with the models and the chipwide module, and the plain
# netlist for the proof, from qdb2ver or from yosys's own writer.
make_netlists() {  # JSON DIR
    if [ "$yosys_netlist" = 1 ]; then
        yosys -q -p "read_json $1; write_verilog -noattr $2/plain.v" &&
            { echo '`timescale 1 ns/1 ps'; cat $(python3 "$tools/lib/cells.py" models "$share" "$1") \
                "$2/plain.v" "$chipwide"; } > "$2/net.v"
        return
    fi
    "$qdb2ver" -ism -pf -w "$1" "$2/net.v" && "$qdb2ver" -w -insert_chipwide false "$1" "$2/plain.v" &&
        # A warning means that the installation's tables do not fit what
        # the flow writes (a parameter of the wrong type, for example).
        ! grep -i -e warning -e error "$2/netlist.log"
}

# check_design NAME TOP JSON RTL REFERENCE; params, pins and noproof set.
check_design() {
    local name=$1 top=$2 json=$3 rtl=$4 reference=$5 dir=$work/$1 sim=- lint=- proof=skipped
    make_netlists "$json" "$dir" > "$dir/netlist.log" 2>&1 || { bad "$name: writing the netlist" &&
        show "$dir/netlist.log" && return; }
    # The RTL takes the parameter values the flow was given; it finds the
    # library cells it instantiates in the timing models.
    python3 "$tools/lib/make_tb.py" "$json" "$top" 300 2026 > "$dir/tb.v"
    python3 "$tools/lib/make_tb.py" "$json" "$top" 300 2026 "${params[@]+"${params[@]}"}" > "$dir/rtl_tb.v"
    if iverilog -g2005 -o "$dir/rtl.vvp" -s nlw_tb -s chipwide -y "$timcells" "$dir/rtl_tb.v" "$reference" \
        "$chipwide" > "$dir/sim.log" 2>&1 &&
        iverilog -g2005 -o "$dir/net.vvp" -s nlw_tb -s chipwide "$dir/tb.v" "$dir/net.v" >> "$dir/sim.log" 2>&1 &&
        vvp -n "$dir/rtl.vvp" > "$dir/rtl.log" 2>&1 && vvp -n "$dir/net.vvp" > "$dir/net.log" 2>&1 &&
        python3 "$tools/lib/compare_sim.py" "$dir/rtl.log" "$dir/net.log" >> "$dir/sim.log"; then
        sim=ok
    else
        sim=MISMATCH && bad "$name: simulation of RTL and netlist" && show "$dir/sim.log"
    fi
    # The lint of docs/flow.md.
    verilator --lint-only --timing -Wno-MULTITOP -Wno-PINMISSING "$dir/net.v" > "$dir/lint.log" 2>&1
    if grep -e '%Error' -e '%Warning' "$dir/lint.log" > "$dir/lint.bad"; then
        lint=FAILED && bad "$name: Verilator's lint of the netlist" && show "$dir/lint.bad"
    else lint=ok; fi
    # Every constrained port, with its location, in the pin map (qdb2ver -pf).
    local port loc
    [ -n "$pins" ] && [ "$yosys_netlist" = 0 ] && while read -r port loc; do
        awk -F '\t' -v port="$port" -v loc="$loc" '{ sub(/ +$/, "", $1); sub(/ +$/, "", $3) }
            $1 == port && $3 == loc { found = 1 } END { exit !found }' "$dir/net.pin" ||
            bad "$name: the pin map lacks $port at $loc"
    done < <(sed -e 's/#.*//' "$pins" | awk 'NF == 2')
    if [ -z "$noproof" ]; then
        if prove "$rtl" "$dir/plain.v" "$top" > "$dir/equiv.log" 2>&1; then proof=ok; else
            proof=FAILED && bad "$name: yosys does not prove the netlist equivalent to the RTL"
            grep -A4 -e 'ERROR' -e 'Unproven' "$dir/equiv.log" | head -n 12 | sed 's/^/    /'
        fi
    fi
    printf '%-14s simulation %-8s lint %-5s proof %s\n' "$name" "$sim" "$lint" "$proof"
}
selected() { [ ${#only[@]} -eq 0 ] || [[ " ${only[*]} " == *" $1 "* ]]; }

for file in "$data"/designs/*.v; do
    name=$(basename "$file" .v)
    selected "$name" || continue
    if [ "$yosys_netlist" = 1 ] && grep -q '^// nlw-test: qdb2ver-only' "$file"; then
        echo "$name: skipped with yosys's netlist writer" && continue
    fi
    mkdir -p "$name"
    read -r -a options <<< "$(directives "$file" flow-options)"
    ref=$(directives "$file" reference)
    noproof=$(grep '^// nlw-test: no-proof' "$file")
    mapfile -t params < <(directives "$file" param)
    for p in "${params[@]+"${params[@]}"}"; do options+=(-P "$p"); done
    pins=$(directives "$file" pins)
    [ -n "$pins" ] && pins=$data/designs/$pins && options+=(-pins "$pins")
    if ! "$src/flow/rtl2json" "${options[@]+"${options[@]}"}" -log "$name/flow.log" "$name" \
        "$name/design.json" "$file" > "$name/flow.out" 2>&1; then
        bad "$name: flow/rtl2json" && show "$name/flow.out" && continue
    fi
    check_design "$name" "$name" "$work/$name/design.json" "$file" "${ref:+$data/designs/}${ref:-$file}"
done

# Below the top the flow's nets and ports are single bits (they simulate
# faster), with -keepbuses (counter_hier) buses as in the RTL.
[ -f cpu_bus/design.json ] && [ -f counter_hier/design.json ] &&
    check "single-bit nets below the top; buses with -keepbuses" python3 - cpu_bus/design.json \
        counter_hier/design.json <<'PY'
import json, sys
widest = [max(len(n["bits"]) for m in json.load(open(f))["modules"].values() if "top" not in m["attributes"]
              for n in list(m["netnames"].values()) + list(m["ports"].values())) for f in sys.argv[1:]]
sys.exit(widest[0] != 1 or widest[1] == 1)
PY

# The example's committed netlist JSON against its RTL, and its own
# self-checking bench on its netlist.
if selected counter; then
    params=() pins="" noproof="" ex=$src/examples/counter
    mkdir -p example
    check_design example counter "$ex/counter.json" "$ex/counter.v" "$ex/counter.v"
    check "counter_tb on the netlist" eval "iverilog -g2005 -o example/tb.vvp example/net.v $ex/counter_tb.v &&
        vvp -n example/tb.vvp | tee example/tb.log && grep -q '^PASS' example/tb.log"
fi
[ "$yosys_netlist" = 1 ] || [ ${#only[@]} -ne 0 ] && finish

# ---------------------------------------------------------------------------
# 3. Installation lookups of qdb2ver.
json=$src/examples/counter/counter.json
# Two roots: the first holds only one model, the second the whole
# installation with its own chipwide module. A missing root and a root that
# is a plain file are passed over.
mkdir -p first/verilog/src/timcells
{ echo "// model from the first root"; cat "$timcells/V_IBUF.v"; } > first/verilog/src/timcells/V_IBUF.v
cp -r "$share" second
sed -i 's|^// chipwide: |// chipwide (second root): |' second/verilog/src/chipwide.v
touch plain_file
check "roots: written" run 0 env VORNIX="$work/missing:$work/plain_file:$work/first:$work/second" \
    "$qdb2ver" -ism -w "$json" roots.v
check "roots: the model of the first root" has roots.v "// model from the first root"
check "roots: V_IBUF copied once" test "$(grep -c '^module V_IBUF ' roots.v)" = 1
check "roots: the chipwide module of the second root" has roots.v "// chipwide (second root): "
check "roots: no message of a missing file" eval "! grep -e \"can't be found\" -e 'No module file' -e VORNIX out.txt"

# An installation without the chipwide module and without one model: both
# are reported, the run fails, and the netlist is still written.
cp -r "$share" third
rm third/verilog/src/chipwide.v third/verilog/src/timcells/V_FDRSE.v
check "missing files: an error" eval "! VORNIX=$work/third $qdb2ver -ism -w $json missing.v > missing.log 2>&1"
check "missing model: the message" has missing.log "No module file found for model V_FDRSE."
check "missing chipwide module: the message" has missing.log "chipwide.v module can't be found in directory \$VORNIX/verilog/src"
check "missing files: the netlist without them" eval "grep -q '^module counter ' missing.v &&
    ! grep -q -e '^module V_FDRSE ' -e '^module chipwide' missing.v"
finish
