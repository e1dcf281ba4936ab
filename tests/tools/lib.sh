# Sourced by every end-to-end script: the paths, a scratch directory, the
# reporting helpers and the steps the scripts share (write a netlist, let
# Icarus Verilog, Verilator and yosys read it, prove it equivalent).
# Environment: NLW_BIN, the build directory; NLW_SRC, the source root.
set -uo pipefail
src=$(cd "${NLW_SRC:-$(dirname "${BASH_SOURCE[0]}")/../..}" && pwd)
bin=${NLW_BIN:-$src/build}
data=$src/tests/data
tools=$src/tests/tools
share=$src/share
funcells=$share/verilog/src/funcells
datdir=${YOSYS_DATDIR:-/usr/share/yosys}
sim="$datdir/simcells.v $datdir/simlib.v"
work=$(mktemp -d "${TMPDIR:-/tmp}/nlw_$(basename "$0" .sh).XXXXXX") || exit 1
[ "${KEEP:-0}" = 1 ] && echo "work directory: $work" || trap 'rm -rf "$work"' EXIT
cd "$work" || exit 1
# The default installation and settings unless a check sets its own.
unset VORNIX NLW_VERILOG_DEFPARM NLW_OLD_PFD
export NLW_TIMESTAMP=${NLW_TIMESTAMP:-"Thu Jan  1 00:00:00 2026"}
fail=0

show() { sed -n '1,30p' "$1" | cut -c1-300 | sed 's/^/    /'; }
ok() { echo "ok   $*"; }
bad() { echo "FAIL $*"; fail=1; }
# check NAME COMMAND...: runs the command (output in log.txt), reports it.
check() {
    local name=$1
    shift
    if "$@" > "$work/log.txt" 2>&1; then ok "$name"; else
        bad "$name"
        show "$work/log.txt"
    fi
}
# run CODE COMMAND...: the command exits with CODE (its output in out.txt).
run() {
    local want=$1
    shift
    "$@" > "$work/out.txt" 2>&1
    local got=$?
    [ "$got" = "$want" ] || { echo "exit $got, expected $want"; cat "$work/out.txt"; return 1; }
}
has() { grep -qF -- "$2" "$1"; }   # FILE TEXT
lacks() { ! grep -qF -- "$2" "$1"; }
# Icarus Verilog and Verilator accept the netlist with the given model files.
compiles() {  # NETLIST TOP MODELS...
    local net=$1 top=$2
    shift 2
    iverilog -g2005 -o "$work/a.out" -s "$top" "$net" "$@" &&
        verilator --lint-only -Wno-fatal -Wno-lint -Wno-style --top-module "$top" "$net" "$@"
}
# yosys proves the netlist equivalent to the gold design: RTL files (.v,
# with any parameter overrides in the array params) or a design file
# (.json). Library cells are read with their functional models, yosys's own
# gates with its simulation models.
prove() {  # GOLD NETLIST TOP [GOLD...]
    local gold=$1 net=$2 top=$3 read p
    shift 3
    case $gold in *.json) read="read_json $gold" ;; *) read="read_verilog $gold $*" ;; esac
    {
        echo "read_verilog -lib $funcells/*.v; $read"
        for p in "${params[@]+"${params[@]}"}"; do echo "chparam -set ${p%%=*} ${p#*=} $top"; done
        # Memories, also the ROMs yosys makes of case tables, as flops and
        # logic that the equivalence passes understand.
        # Single-bit nets on both sides, so that the names match whether the
        # netlist keeps buses (rtl2json -keepbuses) or not.
        echo "prep -top $top; memory_map; setattr -mod -unset keep_hierarchy; flatten; splitnets"
        echo "async2sync; opt_clean; rename $top gold; design -stash gold"
        echo "read_verilog $net; read_verilog $funcells/*.v"
        echo "read_verilog -noblackbox -DSIMLIB_NOCHECKS +/simcells.v +/simlib.v"
        echo "hierarchy -top $top; proc; flatten; splitnets; async2sync; opt_clean; rename $top gate"
        echo "design -stash gate; design -copy-from gold -as gold gold"
        echo "design -copy-from gate -as gate gate; equiv_make gold gate equiv"
        echo "hierarchy -top equiv; equiv_simple -seq 5; equiv_induct -seq 5; equiv_status -assert"
    } > "$work/equiv.ys"
    yosys -q -s "$work/equiv.ys"
}
# Icarus, Verilator and yosys read the netlist, and it is equivalent to GOLD.
accepted() {  # TAG NETLIST TOP GOLD
    check "$1: iverilog and verilator" compiles "$2" "$3" $sim
    check "$1: yosys reads it" yosys -q -p "read_verilog $2; hierarchy -top $3"
    check "$1: equivalent" prove "$4" "$2" "$3"
}
finish() {
    [ "$fail" = 0 ] && echo "all checks passed" || echo "some checks failed"
    exit $fail
}
