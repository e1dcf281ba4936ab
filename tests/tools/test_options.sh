#!/usr/bin/env bash
# Every option of both programs, run on one small design: each row checks the
# effect the option documents (a file, a line of a file, a message), and an
# option that can have no effect prints exactly its one warning.
set -uo pipefail
src=${NLW_SRC:-$(cd "$(dirname "$0")/../.." && pwd)}
bin=${NLW_BIN:-$src/build}
data=$src/tests/data/options
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
fail=0
cp "$data/opt_ram.mem" "$data/opt_top.qcf" "$work/"
printf '12\nzz\n' >"$work/bad.mem"

"$src/flow/rtl2json" -part vx100-fg256-5 top "$work/top.json" "$data/opt_top.v" >/dev/null || exit 1
# The net w carries the attributes that put it into the translation file.
python3 - "$work/top.json" <<'PY'
import json, sys
d = json.load(open(sys.argv[1]))
d["modules"]["top"]["netnames"]["w"]["attributes"].update({"USER_VISIBLE": "1", "hdlname": "w_user"})
json.dump(d, open(sys.argv[1], "w"))
PY

# program | arguments (the design file last unless given) | check | file | text
# Checks: has/not FILE TEXT, file FILE, out/noout TEXT (the program's output),
# warn TEXT (exactly one warning, holding TEXT), fails TEXT (a non-zero exit
# and a message holding TEXT).
rows=$(cat <<'ROWS'
qdb2ver|-10ps|has|top.v|`timescale 1 ns/10 ps
tessel|--10ps|has|top.v|`timescale 1 ns/10 ps
qdb2ver|-aka|has|top.v|// AKA:w_user
tessel|-aka|has|top.v|// AKA:w_user
qdb2ver|-cd|has|top.v|`celldefine
tessel|--cd|has|top.v|`celldefine
qdb2ver|-fn|not|top.v|module sub
tessel|-fn|not|top.v|module sub
qdb2ver|-fn -r|has|top.v|module sub
tessel|-fn --r|has|top.v|module sub
qdb2ver|-gp GSR_PORT|has|top.v|assign chipwide.GSR = GSR_PORT;
tessel|-gp GSR_PORT|has|top.v|input GSR_PORT;
qdb2ver|-tp GTS_PORT|has|top.v|assign chipwide.GTS = GTS_PORT;
tessel|-tp GTS_PORT|has|top.v|input GTS_PORT;
qdb2ver|-ism|has|top.v|module V_FD
tessel|-ism|has|top.v|module V_FD
qdb2ver|-insert_chipwide false|not|top.v|module chipwide
tessel|-insert_chipwide false|not|top.v|module chipwide
qdb2ver|-log l.txt|has|l.txt|Writing Verilog netlist file
tessel|--log l.txt|has|l.txt|Writing Verilog netlist file
qdb2ver|-ne|not|top.v|\$
tessel|-ne|not|top.v|\$
qdb2ver|-pf|has|top.pin|P1
tessel|-pf|has|top.pin|P1
qdb2ver|-quiet|noout||Writing Verilog netlist file
tessel|--quiet|noout||Writing Verilog netlist file
qdb2ver|-tf -shm|has|top.tv|$shm_open
tessel|-tb -shm|has|top.tv|$shm_open
qdb2ver|-tf|has|top.tv|module test;
tessel|-tb|has|top.tv|module test;
qdb2ver|-tf -ti dut|has|top.tv| dut (
tessel|-tb -ti dut|has|top.tv| dut (
qdb2ver|-tm chip|has|top.v|module chip
tessel|-tm chip|has|top.v|module chip
qdb2ver|-ul|has|top.v|`uselib
tessel|-ul|has|top.v|`uselib
qdb2ver|-verbose|out||DEBUG:
tessel|--verbose|out||DEBUG:
tessel|--debug|out||DEBUG:
qdb2ver|--ub|warn||'--ub'
tessel|--ub|warn||'--ub'
tessel|-ecn conformal|has|top.v|supported equivalence checking tools
tessel|-ecn other|warn||Equivalence tool 'other'
tessel|-ecn formality -qdm top.qdm|file|top.svf|
tessel|-ecn conformal -qdm top.qdm|file|top.vxc|
tessel|-sim|has|top.v|uses simulation
tessel|-sta|has|top.pcs|DESIGN#HIERARCHICAL;
tessel|-sta|has|top.pcs|NET#w?w;
tessel|-ofmt verilog|file|top.v|
tessel|-bx mem|has|mem/ram.mem|01
tessel|-bd ../opt_ram.mem tag ram|has|top.v|256'h00000000000000000000000000000000000000000000000000000000CDAB0102
tessel|-bd ../opt_ram.mem tag nosuch|warn||fills no block RAM
tessel|-bd ../bad.mem|fails||'../bad.mem': line 2: 'zz' is not a hexadecimal word
tessel|-qcf ../none.qcf|fails||Cannot read QCF file '../none.qcf'
tessel|-gp clk|fails||already has a port named 'clk'
tessel|-dir o|file|o/top.v|
tessel|-intstyle qde|out||Writing Verilog netlist file
tessel|-intstyle qflow|out||STATUS:NetListWriters - Writing Verilog netlist file
tessel|-intstyle silent|noout||Writing
tessel|-insert_pp_buffers true|has|top.v|V_BUF
tessel|-mhf|file|sub.v|
tessel|-module|not|top.v|module chipwide
tessel|-module -tb|warn||'-tb'
tessel|-qcf ../opt_top.qcf|warn||NET 'nosuch' is not in the design
tessel|-pf -s 4|has|top.pin|// Speed 4
tessel|-timing nominal -s 4|out||Nominal delays of speed grade 4 (x1.25)
tessel|-timing nominal -s 9|warn||Speed grade 9 has no nominal delays
qdb2ver|-timing nominal|has|top.sdf|(PROCESS "nominal")
tessel|-timing nominal|has|top.v|$sdf_annotate("top.sdf")
tessel|-timing nominal -timing_nets port|has|top.sdf|(PORT
qdb2ver|-timing nominal -sdf_path sd|has|top.v|$sdf_annotate("sd/top.sdf")
tessel|-timing nominal -sdf_path sd|file|sd/top.sdf|
tessel|-timing nominal -sdf_anno false|not|top.v|$sdf_annotate
tessel|-tb -vcd|has|top.tv|$dumpfile
tessel|-funcells|out||FUNCELL simulation primitives
tessel|-funcells -ism|not|top.v|MSGON
tessel|-core|has|top.v|syn_black_box
tessel|--cleanup|warn||'--cleanup'
tessel|--suh false|noout||Setup Simulation
tessel|--wraplog w.txt|has|w.txt|STATUS:NetListWriters - Writing Verilog netlist file
tessel|-h sim|out||   -tb                 Generate testfixture file.
tessel|-h sta|out||   -qcf qcf_file
tessel|-h ecn|out||   -ecn tool_name
qdb2ver|-h|out||   -aka                Write Also-Know-As names as comments.
ROWS
)

n=0
while IFS='|' read -r prog args check file text; do
    n=$((n + 1))
    dir=$work/row$n
    mkdir -p "$dir"
    cp "$work/top.json" "$work/top.qdm" "$dir/"
    case "$args" in -h*) design="" ;; *) design=top.json ;; esac
    # shellcheck disable=SC2086
    (cd "$dir" && "$bin/$prog" $args $design) >"$dir/out.txt" 2>&1
    rc=$?
    what="$prog $args: $check $file $text"
    case $check in
    has) grep -qF -- "$text" "$dir/$file" 2>/dev/null ;;
    not) [ -s "$dir/$file" ] && ! grep -qF -- "$text" "$dir/$file" ;;
    file) [ -s "$dir/$file" ] ;;
    out) grep -qF -- "$text" "$dir/out.txt" ;;
    noout) ! grep -qF -- "$text" "$dir/out.txt" ;;
    fails) [ $rc != 0 ] && grep -qF -- "$text" "$dir/out.txt" ;;
    warn) [ "$(grep -c WARNING "$dir/out.txt")" = 1 ] && grep WARNING "$dir/out.txt" | grep -qF -- "$text" ;;
    esac
    if [ $? = 0 ]; then echo "ok   $what"; else echo "FAIL $what"; head -20 "$dir/out.txt"; fail=1; fi
done <<<"$rows"

# -w: an existing netlist is replaced only when asked (and, as this program
# did not write it, only when named).
mkdir -p "$work/w" && cp "$work/top.json" "$work/w/" && echo old >"$work/w/top.v"
(cd "$work/w" && "$bin/tessel" top.json) >/dev/null 2>&1
if grep -qx old "$work/w/top.v"; then echo "ok   without -w the netlist is kept"; else echo "FAIL without -w"; fail=1; fi
(cd "$work/w" && "$bin/qdb2ver" -w top.json top.v) >/dev/null 2>&1
if grep -q "module top" "$work/w/top.v"; then echo "ok   -w replaces it"; else echo "FAIL -w"; fail=1; fi
exit $fail
