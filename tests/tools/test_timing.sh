#!/usr/bin/env bash
# Timing files end to end, with the real tools:
#
#  1. timing/timed.v through yosys synth_ice40 and nextpnr-ice40 (--write,
#     --sdf), then tessel -timing: Icarus Verilog (-gspecify, yosys's iCE40
#     models) annotates the netlist's timing file with no SDF error and no
#     unknown instance; the simulation matches the RTL cycle by cycle, and
#     the outputs change the annotated clock-to-out delay after the clock,
#     later still with -timing_nets iopath; the same with -mhf;
#  2. OpenSTA reads the static timing netlist (with defparam statements)
#     and its timing file without an error or warning, and annotates as many
#     cell arcs, net arcs and setup/hold checks as the place-and-route file
#     has IOPATH, INTERCONNECT and SETUPHOLD entries;
#  3. a design of the shipped library: its static timing netlist and the
#     shipped Liberty file are linked by OpenSTA, report_checks reports a
#     path, and the nominal timing file annotates every arc (one file, and
#     one file per module);
#  4. bad timing input: one clear message each, the documented exit code,
#     and no output file left behind.
#
# Environment: NLW_BIN, the build directory; NLW_SRC, the source root.

set -u

src=${NLW_SRC:-$(cd "$(dirname "${BASH_SOURCE[0]}")/../.." && pwd)}
bin=${NLW_BIN:-$src/build}
tools="$src/tests/tools"
here="$tools/timing"
tessel="$bin/tessel"
cycles=120

for tool in yosys nextpnr-ice40 iverilog vvp sta python3; do
    if ! command -v "$tool" > /dev/null; then
        echo "FAIL: $tool not found on PATH"
        exit 1
    fi
done

work=$(mktemp -d "${TMPDIR:-/tmp}/nlw_timing.XXXXXX") || exit 1
trap 'rm -rf "$work"' EXIT
unset VORNIX
export NLW_TIMESTAMP="Thu Jan  1 00:00:00 2026"

failures=0
fail() {
    echo "FAIL: $*"
    failures=$((failures + 1))
}
show() {
    sed -n '1,30p' "$1" | sed 's/^/    /'
}

# ---------------------------------------------------------------------------
# Place and route.
cd "$work" || exit 1
if ! yosys -q -p "synth_ice40 -top timed -json syn.json" "$here/timed.v" > yosys.log 2>&1; then
    fail "yosys synth_ice40"
    show yosys.log
    exit 1
fi
if ! nextpnr-ice40 --hx1k --package tq144 --seed 1 --pcf-allow-unconstrained -q \
    --json syn.json --write routed.json --sdf routed.sdf > nextpnr.log 2>&1; then
    fail "nextpnr-ice40"
    show nextpnr.log
    exit 1
fi

# yosys's iCE40 models, less the RAM and DSP cells whose specify blocks
# Icarus Verilog 11 rejects.
awk '/^module (SB_RAM40_4K|ICESTORM_RAM|SB_MAC16|SB_SPRAM256KA)/ { skip = 1 }
     !skip { print }
     /^endmodule/ { skip = 0 }' /usr/share/yosys/ice40/cells_sim.v > ice40_cells.v
python3 "$tools/lib/make_tb.py" syn.json timed $cycles 2026 > tb.v
probe_end=$((200 + 20 * cycles - 10))
iv_flags=(-gspecify -DICE40_HX -DNO_ICE40_DEFAULT_ASSIGNMENTS "-DPROBE_END=$probe_end")

if ! { iverilog "${iv_flags[@]}" -o rtl.vvp tb.v "$here/delay_probe.v" "$here/timed.v" &&
    vvp -n rtl.vvp > rtl.out; } > rtl.log 2>&1; then
    fail "RTL simulation"
    show rtl.log
fi

# Simulates the netlist in directory $1 (its files $2...), where the
# netlist's $sdf_annotate finds its timing file, and compares with the RTL.
simulate() {
    local dir=$1
    shift
    if ! (cd "$dir" && iverilog "${iv_flags[@]}" -o sim.vvp ../tb.v "$here/delay_probe.v" "$@" \
        ../ice40_cells.v > iverilog.log 2>&1 && vvp -n sim.vvp > sim.out 2>&1); then
        fail "$dir: simulation"
        show "$dir/iverilog.log"
        return
    fi
    # "Unable to match ModPath" is a path missing from yosys's models.
    if grep -E "SDF ERROR|Unable to find|Cannot find" "$dir/sim.out" > /dev/null; then
        fail "$dir: the timing file does not annotate cleanly"
        grep -E "SDF" "$dir/sim.out" | head -5 | sed 's/^/    /'
    fi
    if ! python3 "$tools/lib/compare_sim.py" rtl.out "$dir/sim.out" > "$dir/compare.log"; then
        fail "$dir: the timing simulation differs from the RTL"
        show "$dir/compare.log"
    fi
}

least_delay() {
    sed -n 's/^least delay \([0-9.]*\) ns/\1/p' "$1"
}

# The smallest typical clock-to-output delay of a timing file, in ns.
least_clock_path() {
    sed -n 's/.*(IOPATH (posedge CLK) O ([0-9]*:\([0-9]*\):.*/\1/p' "$1" |
        sort -n | head -1 | awk '{ printf "%.3f", $1 / 1000 }'
}

# ---------------------------------------------------------------------------
# 1. Icarus Verilog.
mkdir -p one iopath mhf
if ! "$tessel" -w -tm timed -timing routed.sdf routed.json one/timed.v > one/tessel.log 2>&1; then
    fail "tessel -timing"
    show one/tessel.log
fi
[ -s one/timed.sdf ] || fail "no timing file one/timed.sdf"
grep -q 'initial $sdf_annotate("timed.sdf");' one/timed.v || fail "one/timed.v reads no timing file"
if grep -q 'WARNING' one/tessel.log; then
    fail "tessel -timing warns"
    show one/tessel.log
fi
simulate one timed.v
routed=$(least_clock_path one/timed.sdf)
seen=$(least_delay one/sim.out)
if [ -z "$seen" ] || [ -z "$routed" ] ||
    awk -v s="$seen" -v r="$routed" 'BEGIN { exit !(s + 0 < r + 0 || r + 0 <= 0) }'; then
    fail "outputs change ${seen:-?} ns after the clock, not after the annotated ${routed:-?} ns"
fi
[ "$(least_delay rtl.out)" = "0.000" ] || fail "the RTL outputs do not change at the clock edge"

"$tessel" -w -tm timed -timing_nets iopath -timing routed.sdf routed.json iopath/timed.v \
    > iopath/tessel.log 2>&1 || fail "tessel -timing_nets iopath"
grep -q INTERCONNECT iopath/timed.sdf && fail "-timing_nets iopath wrote INTERCONNECT entries"
simulate iopath timed.v
folded=$(least_delay iopath/sim.out)
if [ -z "$folded" ] || awk -v f="$folded" -v s="$seen" 'BEGIN { exit !(f + 0 <= s + 0) }'; then
    fail "with net delays folded into paths the outputs change no later (${folded:-?} ns)"
fi

"$tessel" -w -mhf -tm timed -timing routed.sdf routed.json mhf/timed.v > mhf/tessel.log 2>&1 ||
    fail "tessel -mhf -timing"
grep -q 'initial $sdf_annotate("timed.sdf");' mhf/timed.v || fail "mhf/timed.v reads no timing file"
cmp -s one/timed.sdf mhf/timed.sdf || fail "the module's timing file differs from the design's"
simulate mhf timed.v chipwide.v

# Same input, same bytes.
"$tessel" -w -tm timed -timing routed.sdf routed.json again.v > /dev/null 2>&1
cmp -s one/timed.sdf again.sdf || fail "two runs give different timing files"

# ---------------------------------------------------------------------------
# 2. OpenSTA on the place-and-route delays.
mkdir -p sta
NLW_VERILOG_DEFPARM=1 "$tessel" -w -sta -sdf_anno false -tm timed -timing routed.sdf routed.json \
    sta/timed.v > sta/tessel.log 2>&1 || fail "tessel -sta -timing"
cat > sta/run.tcl << EOF
read_liberty $here/ice40.lib
read_verilog sta/timed.v
link_design timed
read_sdf sta/timed.sdf
report_annotated_delay
report_annotated_check
EOF
timeout 120 sta -no_init -exit sta/run.tcl > sta/sta.log 2>&1 || fail "sta"
if ! python3 "$here/sdf_counts.py" routed.sdf sta/sta.log > sta/counts.log; then
    fail "OpenSTA annotates other counts than the place-and-route file has"
    show sta/counts.log
fi

# ---------------------------------------------------------------------------
# 3. The shipped library with nominal delays.
mkdir -p lib/mhf
if bash "$src/flow/rtl2json" counter_hier lib/ch.json "$src/tests/data/designs/counter_hier.v" \
    > lib/rtl2json.log 2>&1; then
    NLW_VERILOG_DEFPARM=1 "$tessel" -w -sta -sdf_anno false -timing nominal lib/ch.json \
        lib/ch.v > lib/tessel.log 2>&1 || fail "tessel -timing nominal"
    grep -q '(PROCESS "nominal")' lib/ch.sdf || fail "the nominal timing file does not say so"
    NLW_VERILOG_DEFPARM=1 "$tessel" -w -sta -mhf -sdf_anno false -timing nominal lib/ch.json \
        lib/mhf/counter_hier.v > lib/mhf/tessel.log 2>&1 || fail "tessel -mhf -timing nominal"
    cat > lib/run.tcl << EOF
read_liberty $src/share/data/nlw_cells.lib
read_verilog lib/ch.v
link_design counter_hier
create_clock -name clk -period 10 [get_ports clk]
report_checks
read_sdf lib/ch.sdf
report_annotated_delay
report_annotated_check
EOF
    # One file per module: each module's cells and checks from its own
    # file. OpenSTA 2.0 does not apply read_sdf -path to INTERCONNECT
    # entries, so nets are counted on the single file only.
    cat > lib/mhf.tcl << EOF
read_liberty $src/share/data/nlw_cells.lib
read_verilog lib/mhf/counter8.v
read_verilog lib/mhf/compare8.v
read_verilog lib/mhf/counter_hier.v
link_design counter_hier
read_sdf lib/mhf/counter_hier.sdf
read_sdf -path u_a lib/mhf/counter8.sdf
read_sdf -path u_b lib/mhf/counter8.sdf
read_sdf -path u_cmp lib/mhf/compare8.sdf
report_annotated_delay
report_annotated_check
EOF
    timeout 120 sta -no_init -exit lib/run.tcl > lib/sta.log 2>&1 || fail "sta (shipped library)"
    if grep -E '^(Error|Warning)' lib/sta.log > /dev/null; then
        fail "sta reports problems"
        show lib/sta.log
    fi
    grep -q 'Startpoint:' lib/sta.log || fail "report_checks reports no path"
    # Every row of both annotation reports has nothing left unannotated.
    awk '/arcs/ && $NF != 0 { bad = 1; print "    " $0 } END { exit bad }' lib/sta.log ||
        fail "the nominal timing file leaves arcs unannotated"
    timeout 120 sta -no_init -exit lib/mhf.tcl > lib/mhf/sta.log 2>&1 || fail "sta (-mhf)"
    awk '/^(cell arcs|cell setup arcs|cell hold arcs)/ && $NF != 0 { bad = 1; print "    " $0 }
         END { exit bad }' lib/mhf/sta.log || fail "the per-module files leave cell arcs unannotated"
else
    fail "rtl2json"
    show lib/rtl2json.log
fi

# ---------------------------------------------------------------------------
# 4. Bad timing input.
lc=$(sed -n 's/.*(INSTANCE \([A-Za-z_0-9]*_LC\)).*/\1/p' routed.sdf | head -1)
# Writes routed.sdf with one more CELL ($2) to $1.
with_cell() {
    sed '$d' routed.sdf > "$1"
    printf '%s\n)\n' "$2" >> "$1"
}
head -c 3000 routed.sdf > bad_truncated.sdf
with_cell bad_instance.sdf '(CELL (CELLTYPE "ICESTORM_LC") (INSTANCE no_such_cell) (DELAY (ABSOLUTE (IOPATH I0 O (1:1:1)))))'
with_cell bad_pin.sdf "(CELL (CELLTYPE \"ICESTORM_LC\") (INSTANCE $lc) (DELAY (ABSOLUTE (IOPATH I9 O (1:1:1)))))"
with_cell bad_type.sdf "(CELL (CELLTYPE \"SB_IO\") (INSTANCE $lc) (DELAY (ABSOLUTE (IOPATH I0 O (1:1:1)))))"
with_cell bad_number.sdf "(CELL (CELLTYPE \"ICESTORM_LC\") (INSTANCE $lc) (DELAY (ABSOLUTE (IOPATH I0 O (1:fast:3)))))"
# case | exit code | the one message of its level | its text
while IFS='|' read -r name code level text; do
    mkdir -p "bad/$name"
    "$tessel" -timing "bad_$name.sdf" routed.json "bad/$name/top.v" > "bad/$name/log" 2>&1
    got=$?
    [ "$got" = "$code" ] || fail "bad $name: exit code $got, not $code"
    n=$(grep -c "^$level" "bad/$name/log")
    [ "$n" = 1 ] || fail "bad $name: $n '$level' messages, not 1"
    if ! grep -q -- "$text" "bad/$name/log"; then
        fail "bad $name: no message '$text'"
        show "bad/$name/log"
    fi
    if [ "$code" = 2 ] && [ -n "$(ls -A "bad/$name" | grep -v '^log$')" ]; then
        fail "bad $name: files left behind: $(ls "bad/$name")"
    fi
done << 'CASES'
truncated|2|ERROR|bad_truncated.sdf:[0-9]*: .*the end of the file
instance|0|WARNING.*no instance|no instance 'no_such_cell' in the design
pin|0|WARNING.*no pin|has no pin 'I9'
type|0|WARNING.*not 'SB_IO'|is of type 'ICESTORM_LC', not 'SB_IO'
number|2|ERROR|delay value 'fast' is not a number
CASES
grep -q "1 timing entries of 'bad_instance.sdf' match nothing" bad/instance/log ||
    fail "no count of the entries that match nothing"

# The output timing file must not replace the input.
mkdir -p over
cp routed.sdf over/top.sdf
"$tessel" -w -timing over/top.sdf routed.json over/top.v > over/log 2>&1
[ $? = 2 ] || fail "writing over the input timing file is not refused"
grep -q "would be written over the input timing file" over/log || fail "no message for it"
cmp -s routed.sdf over/top.sdf || fail "the input timing file was changed"
[ -e over/top.v ] && fail "a netlist was written although the run was refused"

if [ "$failures" -gt 0 ]; then
    echo "$failures check(s) failed"
    exit 1
fi
echo "timing checks passed"
