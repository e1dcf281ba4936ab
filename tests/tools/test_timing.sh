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
#     and no output file left behind (the reader's messages for each kind
#     of fault: InstallationDataTest's timing entries).
source "$(dirname "$0")/lib.sh"
here=$data/timing
tessel=$bin/tessel
cycles=120

# ---------------------------------------------------------------------------
# Place and route.
check "yosys synth_ice40" yosys -q -p "synth_ice40 -top timed -json syn.json" "$here/timed.v"
check "nextpnr-ice40" nextpnr-ice40 --hx1k --package tq144 --seed 1 --pcf-allow-unconstrained -q \
    --json syn.json --write routed.json --sdf routed.sdf
[ "$fail" = 0 ] || finish

# yosys's iCE40 models, less the RAM and DSP cells whose specify blocks
# Icarus Verilog 11 rejects.
awk '/^module (SB_RAM40_4K|ICESTORM_RAM|SB_MAC16|SB_SPRAM256KA)/ { skip = 1 }
     !skip { print }
     /^endmodule/ { skip = 0 }' "$datdir/ice40/cells_sim.v" > ice40_cells.v
python3 "$tools/lib/make_tb.py" syn.json timed $cycles 2026 > tb.v
iv_flags=(-gspecify -DICE40_HX -DNO_ICE40_DEFAULT_ASSIGNMENTS "-DPROBE_END=$((200 + 20 * cycles - 10))")
check "RTL simulation" eval 'iverilog "${iv_flags[@]}" -o rtl.vvp tb.v "$here/delay_probe.v" "$here/timed.v" &&
    vvp -n rtl.vvp > rtl.out'

# Simulates the netlist in directory $1 (its files $2...), where the
# netlist's $sdf_annotate finds its timing file, and compares with the RTL.
# "Unable to match ModPath" is a path missing from yosys's models.
simulate() {
    local dir=$1 files
    shift
    files="$*"
    check "$dir: simulation" eval '(cd "$dir" && iverilog "${iv_flags[@]}" -o sim.vvp ../tb.v "$here/delay_probe.v" \
        $files ../ice40_cells.v && vvp -n sim.vvp > sim.out)'
    check "$dir: the timing file annotates cleanly" eval '! grep -E "SDF ERROR|Unable to find|Cannot find" "$dir/sim.out"'
    check "$dir: the timing simulation is the RTL's" python3 "$tools/lib/compare_sim.py" rtl.out "$dir/sim.out"
}
least_delay() { sed -n 's/^least delay \([0-9.]*\) ns/\1/p' "$1"; }
# The smallest typical clock-to-output delay of a timing file, in ns.
least_clock_path() {
    sed -n 's/.*(IOPATH (posedge CLK) O ([0-9]*:\([0-9]*\):.*/\1/p' "$1" |
        sort -n | head -1 | awk '{ printf "%.3f", $1 / 1000 }'
}
# less A B: both are numbers and A < B.
less() { [ -n "$1" ] && [ -n "$2" ] && awk -v a="$1" -v b="$2" 'BEGIN { exit !(a + 0 < b + 0) }'; }

# ---------------------------------------------------------------------------
# 1. Icarus Verilog.
mkdir -p one iopath mhf
check "tessel -timing" run 0 "$tessel" -w -tm timed -timing routed.sdf routed.json one/timed.v
check "tessel -timing does not warn" lacks out.txt WARNING
check "a timing file" test -s one/timed.sdf
check "one/timed.v reads it" has one/timed.v 'initial $sdf_annotate("timed.sdf");'
simulate one timed.v
routed=$(least_clock_path one/timed.sdf)
seen=$(least_delay one/sim.out)
check "outputs change ${seen:-?} ns after the clock, the annotated ${routed:-?} ns" \
    eval '[ -n "$seen" ] && less 0 "$routed" && ! less "$seen" "$routed"'
check "the RTL outputs change at the clock edge" test "$(least_delay rtl.out)" = 0.000

check "tessel -timing_nets iopath" "$tessel" -w -tm timed -timing_nets iopath -timing routed.sdf routed.json \
    iopath/timed.v
check "-timing_nets iopath writes no INTERCONNECT entries" lacks iopath/timed.sdf INTERCONNECT
simulate iopath timed.v
folded=$(least_delay iopath/sim.out)
check "with net delays folded into paths the outputs change later (${folded:-?} ns)" less "$seen" "$folded"

check "tessel -mhf -timing" "$tessel" -w -mhf -tm timed -timing routed.sdf routed.json mhf/timed.v
check "mhf/timed.v reads its timing file" has mhf/timed.v 'initial $sdf_annotate("timed.sdf");'
check "the module's timing file is the design's" cmp one/timed.sdf mhf/timed.sdf
simulate mhf timed.v chipwide.v
"$tessel" -w -tm timed -timing routed.sdf routed.json again.v > /dev/null 2>&1
check "two runs give the same timing file" cmp one/timed.sdf again.sdf

# ---------------------------------------------------------------------------
# 2. OpenSTA on the place-and-route delays.
mkdir -p sta
check "tessel -sta -timing" env NLW_VERILOG_DEFPARM=1 "$tessel" -w -sta -sdf_anno false -tm timed \
    -timing routed.sdf routed.json sta/timed.v
printf '%s\n' "read_liberty $here/ice40.lib" "read_verilog sta/timed.v" "link_design timed" \
    "read_sdf sta/timed.sdf" report_annotated_delay report_annotated_check > sta/run.tcl
timeout 120 sta -no_init -exit sta/run.tcl > sta/sta.log 2>&1
check "OpenSTA annotates the counts the place-and-route file has" \
    python3 "$tools/timing/sdf_counts.py" routed.sdf sta/sta.log

# ---------------------------------------------------------------------------
# 3. The shipped library with nominal delays.
mkdir -p lib/mhf
check "rtl2json" "$src/flow/rtl2json" counter_hier lib/ch.json "$data/designs/counter_hier.v"
check "tessel -timing nominal" env NLW_VERILOG_DEFPARM=1 "$tessel" -w -sta -sdf_anno false -timing nominal \
    lib/ch.json lib/ch.v
check "the nominal timing file says so" has lib/ch.sdf '(PROCESS "nominal")'
check "tessel -mhf -timing nominal" env NLW_VERILOG_DEFPARM=1 "$tessel" -w -sta -mhf -sdf_anno false \
    -timing nominal lib/ch.json lib/mhf/counter_hier.v
lib=$share/data/nlw_cells.lib
printf '%s\n' "read_liberty $lib" "read_verilog lib/ch.v" "link_design counter_hier" \
    "create_clock -name clk -period 10 [get_ports clk]" report_checks "read_sdf lib/ch.sdf" \
    report_annotated_delay report_annotated_check > lib/run.tcl
# One file per module: each module's cells and checks from its own file.
# OpenSTA 2.0 does not apply read_sdf -path to INTERCONNECT entries, so
# nets are counted on the single file only.
printf '%s\n' "read_liberty $lib" "read_verilog lib/mhf/counter8.v" "read_verilog lib/mhf/compare8.v" \
    "read_verilog lib/mhf/counter_hier.v" "link_design counter_hier" "read_sdf lib/mhf/counter_hier.sdf" \
    "read_sdf -path u_a lib/mhf/counter8.sdf" "read_sdf -path u_b lib/mhf/counter8.sdf" \
    "read_sdf -path u_cmp lib/mhf/compare8.sdf" report_annotated_delay report_annotated_check > lib/mhf.tcl
check "sta (shipped library)" timeout 120 sta -no_init -exit lib/run.tcl
cp log.txt lib/sta.log
check "sta reports no problems" eval "! grep -E '^(Error|Warning)' lib/sta.log"
check "report_checks reports a path" has lib/sta.log 'Startpoint:'
# Every row of both annotation reports has nothing left unannotated.
check "the nominal timing file annotates every arc" awk '/arcs/ && $NF != 0 { bad = 1; print } END { exit bad }' \
    lib/sta.log
check "sta (-mhf)" timeout 120 sta -no_init -exit lib/mhf.tcl
check "the per-module files annotate every cell arc" awk '/^(cell arcs|cell setup arcs|cell hold arcs)/ &&
    $NF != 0 { bad = 1; print } END { exit bad }' log.txt

# ---------------------------------------------------------------------------
# 4. Bad timing input.
head -c 3000 routed.sdf > bad_truncated.sdf
# routed.sdf with one more CELL, of an instance the design lacks.
sed '$d' routed.sdf > bad_instance.sdf
echo '(CELL (CELLTYPE "ICESTORM_LC") (INSTANCE no_such_cell) (DELAY (ABSOLUTE (IOPATH I0 O (1:1:1))))))' \
    >> bad_instance.sdf
# case | exit code | the one message of its level | its text
while IFS='|' read -r name code level text; do
    mkdir -p "bad/$name"
    check "bad $name: exit $code" run "$code" "$tessel" -timing "bad_$name.sdf" routed.json "bad/$name/top.v"
    check "bad $name: one '$level' message" test "$(grep -c "^$level" out.txt)" = 1
    check "bad $name: '$text'" grep -q -- "$text" out.txt
    [ "$code" = 2 ] && check "bad $name: no file left behind" test -z "$(ls -A "bad/$name")"
    [ "$name" = instance ] && check "the count of the entries that match nothing" \
        has out.txt "1 timing entries of 'bad_instance.sdf' match nothing"
done << 'CASES'
truncated|2|ERROR|bad_truncated.sdf:[0-9]*: .*the end of the file
instance|0|WARNING.*no instance|no instance 'no_such_cell' in the design
CASES

# The output timing file must not replace the input.
mkdir -p over
cp routed.sdf over/top.sdf
check "writing over the input timing file is refused" run 2 "$tessel" -w -timing over/top.sdf routed.json over/top.v
check "with a message" has out.txt "would be written over the input timing file"
check "the input timing file is unchanged" cmp routed.sdf over/top.sdf
check "no netlist is written" test ! -e over/top.v
finish
