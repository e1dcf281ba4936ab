#!/usr/bin/env bash
# End-to-end checks of the default installation, the RTL flow and qdb2ver:
#
#  1. the cell library agrees with the installation's data files, compiles
#     with Icarus Verilog and passes Verilator's lint (lib/check_cells.py);
#     the timing and functional models behave alike (lib/compare_models.py);
#     the timing models pass directed checks (tests/data/cells_directed_tb.v);
#  2. every design under tests/data/designs/, and the committed example, goes
#     RTL -> flow/rtl2json -> qdb2ver -ism -> one netlist file that Icarus
#     compiles on its own; a random-stimulus bench gives the same outputs,
#     cycle by cycle, on the RTL and on the netlist; Verilator lints the
#     netlist without a warning (docs/flow.md); yosys proves the netlist
#     (read with the functional models) equivalent to the RTL; a design's
#     top-level parameter overrides and pin constraints go through the
#     flow, and the pin map lists every constrained port;
#  3. qdb2ver's installation lookups: the `uselib directive of -ul, models
#     and the chipwide module found along a list of installation roots, and
#     the messages for missing ones.
#
# Environment: NLW_BIN, the build directory holding qdb2ver; NLW_SRC, the
# source root. Options: --yosys-netlist checks yosys's own netlist writer
# instead of qdb2ver (parts 1 and 2 only); --keep keeps the work directory;
# further arguments name the designs to check (default: all).

set -u

src=${NLW_SRC:-$(cd "$(dirname "${BASH_SOURCE[0]}")/../.." && pwd)}
bin=${NLW_BIN:-$src/build}
share="$src/share"
tools="$src/tests/tools"
lib="$tools/lib"
qdb2ver="$bin/qdb2ver"
cycles=300
seed=2026

use_yosys_netlist=0
keep=0
only=()
for arg in "$@"; do
    case "$arg" in
    --yosys-netlist) use_yosys_netlist=1 ;;
    --keep) keep=1 ;;
    -*)
        echo "usage: $0 [--yosys-netlist] [--keep] [design...]" >&2
        exit 2
        ;;
    *) only+=("$arg") ;;
    esac
done

for tool in yosys iverilog vvp verilator python3; do
    if ! command -v "$tool" > /dev/null; then
        echo "FAIL: $tool not found on PATH"
        exit 1
    fi
done
if [ "$use_yosys_netlist" = 0 ] && [ ! -x "$qdb2ver" ]; then
    echo "FAIL: no qdb2ver in '$bin' (set NLW_BIN, or use --yosys-netlist)"
    exit 1
fi

work=$(mktemp -d "${TMPDIR:-/tmp}/nlw_flow_sim.XXXXXX") || exit 1
if [ "$keep" = 1 ]; then
    echo "work directory: $work"
else
    trap 'rm -rf "$work"' EXIT
fi

# The checks run with the default installation unless a check sets its own.
unset VORNIX
export NLW_TIMESTAMP="Thu Jan  1 00:00:00 2026"

failures=0
fail() {
    echo "FAIL: $*"
    failures=$((failures + 1))
}

# Prints the start of a log, indented, after a failure.
show() {
    sed -n '1,40p' "$1" | sed 's/^/    /'
}

# ---------------------------------------------------------------------------
# 1. The cell library.

if python3 "$lib/check_cells.py" "$share" "$work/cells" > "$work/cells.log" 2>&1; then
    tail -n 1 "$work/cells.log"
else
    fail "cell library"
    show "$work/cells.log"
fi
if python3 "$lib/compare_models.py" "$share" "$work/models" > "$work/models.log" 2>&1; then
    tail -n 1 "$work/models.log"
else
    fail "timing and functional models differ"
    show "$work/models.log"
fi
if iverilog -g2005 -gspecify -o "$work/directed.vvp" -s cells_directed_tb -s chipwide \
    -y "$share/verilog/src/timcells" "$src/tests/data/cells_directed_tb.v" "$share/verilog/src/chipwide.v" \
    > "$work/directed.log" 2>&1 &&
    vvp -n "$work/directed.vvp" >> "$work/directed.log" 2>&1 &&
    grep -q '^directed: [0-9]* checks, 0 failures' "$work/directed.log"; then
    grep '^directed:' "$work/directed.log"
else
    fail "directed checks of the timing models"
    show "$work/directed.log"
fi

# ---------------------------------------------------------------------------
# 2. Designs through the flow, simulation and proof.

# directive FILE NAME: the text after "nlw-test: NAME" in FILE's comments.
directive() {
    sed -n "s|^// nlw-test: $2 *\(.*\)\$|\1|p" "$1" | head -n 1
}
# All values of a repeatable directive, one a line.
directives() {
    sed -n "s|^// nlw-test: $2 *\(.*\)\$|\1|p" "$1"
}
has_directive() {
    grep -q "^// nlw-test: $2" "$1"
}

# The netlist file with the models and the chipwide module, and the plain
# netlist for the proof, from qdb2ver or from yosys's own writer.
make_netlists() { # JSON TOP DIR
    local json=$1 top=$2 dir=$3
    if [ "$use_yosys_netlist" = 1 ]; then
        yosys -q -p "read_json $json; write_verilog -noattr $dir/plain.v" > "$dir/netlist.log" 2>&1 ||
            return 1
        python3 "$lib/model_files.py" "$share" "$json" > "$dir/models.txt" || return 1
        {
            echo '`timescale 1 ns/1 ps'
            while read -r f; do cat "$f"; done < "$dir/models.txt"
            cat "$dir/plain.v" "$share/verilog/src/chipwide.v"
        } > "$dir/net.v"
        return 0
    fi
    "$qdb2ver" -ism -pf -w "$json" "$dir/net.v" > "$dir/netlist.log" 2>&1 || return 1
    "$qdb2ver" -w -insert_chipwide false "$json" "$dir/plain.v" >> "$dir/netlist.log" 2>&1 ||
        return 1
    # A warning here means that the installation's tables do not fit what
    # the flow writes (a parameter of the wrong type, for example).
    ! grep -q -i -e 'warning' -e 'error' "$dir/netlist.log"
}

prove() { # RTL... -- PLAIN TOP DIR
    local files=()
    while [ "$1" != "--" ]; do
        files+=("$1")
        shift
    done
    local plain=$2 top=$3 dir=$4 p
    {
        echo "read_verilog -lib $share/verilog/src/funcells/*.v"
        echo "read_verilog ${files[*]}"
        for p in "${params[@]+"${params[@]}"}"; do
            echo "chparam -set ${p%%=*} ${p#*=} $top"
        done
        echo "prep -top $top"
        # Memories, also the ROMs yosys makes of case tables, as flops and
        # logic that the equivalence passes understand.
        echo "memory_map"
        echo "flatten"
        echo "async2sync"
        echo "opt_clean"
        echo "rename $top gold"
        echo "design -stash gold"
        echo "read_verilog $plain"
        echo "read_verilog $share/verilog/src/funcells/*.v"
        echo "hierarchy -top $top"
        echo "proc"
        echo "flatten"
        echo "async2sync"
        echo "opt_clean"
        echo "rename $top gate"
        echo "design -stash gate"
        echo "design -copy-from gold -as gold gold"
        echo "design -copy-from gate -as gate gate"
        echo "equiv_make gold gate equiv"
        echo "hierarchy -top equiv"
        echo "equiv_simple -seq 5"
        echo "equiv_induct -seq 5"
        echo "equiv_status -assert"
    } > "$dir/equiv.ys"
    yosys -q -l "$dir/equiv.log" -s "$dir/equiv.ys" > /dev/null 2>&1
}

# check_design NAME TOP JSON RTL REFERENCE NOPROOF
check_design() {
    local name=$1 top=$2 json=$3 rtl=$4 reference=$5 noproof=$6
    local dir="$work/$name"
    local cells sim="-" proof="-" lint="-"
    cells=$(python3 -c 'import json, sys
m = json.load(open(sys.argv[1]))["modules"]
print(sum(len(x["cells"]) for x in m.values()))' "$json")

    if ! make_netlists "$json" "$top" "$dir"; then
        fail "$name: writing the netlist"
        show "$dir/netlist.log"
        return
    fi
    python3 "$lib/make_tb.py" "$json" "$top" "$cycles" "$seed" > "$dir/tb.v"
    # The RTL takes the parameter values the flow was given.
    python3 "$lib/make_tb.py" "$json" "$top" "$cycles" "$seed" "${params[@]+"${params[@]}"}" \
        > "$dir/rtl_tb.v"

    # The reference simulation finds library cells the RTL instantiates in
    # the timing models.
    if ! iverilog -g2005 -o "$dir/rtl.vvp" -s nlw_tb -s chipwide -y "$share/verilog/src/timcells" \
        "$dir/rtl_tb.v" "$reference" "$share/verilog/src/chipwide.v" > "$dir/rtl_build.log" 2>&1; then
        fail "$name: compiling the RTL bench"
        show "$dir/rtl_build.log"
        return
    fi
    if ! iverilog -g2005 -o "$dir/net.vvp" -s nlw_tb -s chipwide "$dir/tb.v" "$dir/net.v" \
        > "$dir/net_build.log" 2>&1; then
        fail "$name: compiling the netlist bench"
        show "$dir/net_build.log"
        return
    fi
    vvp -n "$dir/rtl.vvp" > "$dir/rtl.log" 2>&1
    vvp -n "$dir/net.vvp" > "$dir/net.log" 2>&1
    if python3 "$lib/compare_sim.py" "$dir/rtl.log" "$dir/net.log" > "$dir/compare.log"; then
        sim="ok"
    else
        sim="MISMATCH"
        fail "$name: simulation outputs differ"
        show "$dir/compare.log"
    fi

    # The lint of docs/flow.md.
    verilator --lint-only --timing -Wno-MULTITOP -Wno-PINMISSING "$dir/net.v" \
        > "$dir/lint.log" 2>&1
    if grep -q -e '%Error' -e '%Warning' "$dir/lint.log"; then
        lint="FAILED"
        fail "$name: Verilator's lint of the netlist"
        grep -e '%Error' -e '%Warning' "$dir/lint.log" | head -n 5 | sed 's/^/    /'
    else
        lint="ok"
    fi

    # Every constrained port, with its location, in the pin map.
    if [ -n "$pins" ]; then
        local port loc
        while read -r port loc; do
            if ! awk -F '\t' -v port="$port" -v loc="$loc" '{ sub(/ +$/, "", $1); sub(/ +$/, "", $3) }
                $1 == port && $3 == loc { found = 1 } END { exit !found }' "$dir/net.pin"; then
                fail "$name: the pin map lacks $port at $loc"
            fi
        done < <(sed -e 's/#.*//' "$pins" | awk 'NF == 2')
    fi

    if [ -n "$noproof" ]; then
        proof="skipped"
    elif prove "$rtl" -- "$dir/plain.v" "$top" "$dir"; then
        proof="ok"
    else
        proof="FAILED"
        fail "$name: yosys does not prove the netlist equivalent to the RTL"
        grep -A4 -e 'ERROR' -e 'Unproven' "$dir/equiv.log" | head -n 12 | sed 's/^/    /'
    fi
    printf '%-14s %5s cells   simulation %-8s lint %-5s proof %s\n' "$name" "$cells" "$sim" "$lint" \
        "$proof"
}

selected() {
    [ ${#only[@]} -eq 0 ] && return 0
    local o
    for o in "${only[@]}"; do
        [ "$o" = "$1" ] && return 0
    done
    return 1
}

for file in "$src"/tests/data/designs/*.v; do
    name=$(basename "$file" .v)
    selected "$name" || continue
    if [ "$use_yosys_netlist" = 1 ] && has_directive "$file" qdb2ver-only; then
        printf '%-14s skipped with yosys'"'"'s netlist writer\n' "$name"
        continue
    fi
    dir="$work/$name"
    mkdir -p "$dir"
    read -r -a options <<< "$(directive "$file" flow-options)"
    reference="$file"
    ref=$(directive "$file" reference)
    [ -n "$ref" ] && reference="$src/tests/data/designs/$ref"
    noproof=""
    has_directive "$file" no-proof && noproof=1
    params=()
    while read -r p; do
        [ -n "$p" ] && params+=("$p") && options+=(-P "$p")
    done < <(directives "$file" param)
    pins=""
    if [ -n "$(directive "$file" pins)" ]; then
        pins="$src/tests/data/designs/$(directive "$file" pins)"
        options+=(-pins "$pins")
    fi
    if ! "$src/flow/rtl2json" "${options[@]+"${options[@]}"}" -log "$dir/flow.log" "$name" \
        "$dir/design.json" "$file" > "$dir/flow.out" 2>&1; then
        fail "$name: flow/rtl2json"
        show "$dir/flow.out"
        continue
    fi
    check_design "$name" "$name" "$dir/design.json" "$file" "$reference" "$noproof"
done

# The example's committed netlist JSON against its RTL.
if selected counter; then
    params=()
    pins=""
    mkdir -p "$work/example"
    check_design example counter "$src/examples/counter/counter.json" \
        "$src/examples/counter/counter.v" "$src/examples/counter/counter.v" ""
    # The example's own self-checking bench on its netlist.
    if [ -f "$work/example/net.v" ]; then
        if iverilog -g2005 -o "$work/example/tb.vvp" "$work/example/net.v" \
            "$src/examples/counter/counter_tb.v" > "$work/example/counter_tb.log" 2>&1 &&
            vvp -n "$work/example/tb.vvp" >> "$work/example/counter_tb.log" 2>&1 &&
            grep -q '^PASS' "$work/example/counter_tb.log"; then
            echo "counter_tb     ok"
        else
            fail "examples/counter/counter_tb.v on the netlist"
            show "$work/example/counter_tb.log"
        fi
    fi
fi

# ---------------------------------------------------------------------------
# 3. Installation lookups of qdb2ver.

if [ "$use_yosys_netlist" = 0 ] && [ ${#only[@]} -eq 0 ]; then
    json="$src/examples/counter/counter.json"
    look="$work/lookups"
    mkdir -p "$look"

    # -ul names the timing models of the default installation: the share
    # directory beside the program, else the source tree's.
    expected="$src/share/verilog/src/timcells"
    [ -d "$bin/../share/verilog/src" ] && expected="$bin/../share/verilog/src/timcells"
    if "$qdb2ver" -ul -w "$json" "$look/ul.v" > "$look/ul.log" 2>&1; then
        dir=$(sed -n 's/^`uselib dir=\(.*\) libext=\.v$/\1/p' "$look/ul.v" | head -n 1)
        if [ -z "$dir" ] || [ "$(realpath "$dir")" != "$(realpath "$expected")" ]; then
            fail "-ul: the uselib line names '$dir', not '$expected'"
        elif [ "$(grep -v '^$' "$look/ul.v" | tail -n 1)" != '`uselib' ]; then
            fail "-ul: the netlist does not end with a bare \`uselib line"
        else
            echo "uselib         ok ($dir)"
        fi
    else
        fail "-ul: qdb2ver failed"
        show "$look/ul.log"
    fi

    # Two roots: the first holds only one model, the second the whole
    # installation with its own chipwide module. A missing root and a root
    # that is a plain file are passed over.
    first="$look/first"
    second="$look/second"
    mkdir -p "$first/verilog/src/timcells"
    { echo "// model from the first root"; cat "$share/verilog/src/timcells/V_IBUF.v"; } \
        > "$first/verilog/src/timcells/V_IBUF.v"
    cp -r "$share" "$second"
    sed -i 's|^// chipwide: |// chipwide (second root): |' "$second/verilog/src/chipwide.v"
    touch "$look/plain_file"
    if VORNIX="$look/missing:$look/plain_file:$first:$second" "$qdb2ver" -ism -w "$json" \
        "$look/roots.v" > "$look/roots.log" 2>&1; then
        if ! grep -q '^// model from the first root' "$look/roots.v"; then
            fail "roots: the model of the first root was not copied"
        elif [ "$(grep -c '^module V_IBUF ' "$look/roots.v")" != 1 ]; then
            fail "roots: V_IBUF is not copied exactly once"
        elif ! grep -q '^// chipwide (second root): ' "$look/roots.v"; then
            fail "roots: the chipwide module of the second root was not copied"
        elif grep -q -e "can't be found" -e 'No module file' -e 'VORNIX' "$look/roots.log"; then
            fail "roots: unexpected messages"
            show "$look/roots.log"
        else
            echo "roots          ok"
        fi
    else
        fail "roots: qdb2ver failed"
        show "$look/roots.log"
    fi

    # An installation without the chipwide module and without one model:
    # both are reported and the netlist is still written.
    third="$look/third"
    cp -r "$share" "$third"
    rm "$third/verilog/src/chipwide.v" "$third/verilog/src/timcells/V_FDRSE.v"
    missing_status=0
    VORNIX="$third" "$qdb2ver" -ism -w "$json" "$look/missing.v" > "$look/missing.log" 2>&1 ||
        missing_status=$?
    if [ "$missing_status" = 0 ]; then
        fail "missing model: qdb2ver reports success after an error"
    elif ! grep -q 'No module file found for model V_FDRSE\.' "$look/missing.log"; then
        fail "missing model: no message"
        show "$look/missing.log"
    elif ! grep -q "chipwide.v module can.t be found in directory \\\$VORNIX/verilog/src" \
        "$look/missing.log"; then
        fail "missing chipwide module: no message"
        show "$look/missing.log"
    elif ! grep -q '^module counter ' "$look/missing.v" || grep -q '^module V_FDRSE ' "$look/missing.v" ||
        grep -q '^module chipwide' "$look/missing.v"; then
        fail "missing files: the netlist is not as expected"
    else
        echo "missing files  ok"
    fi
fi

if [ "$failures" -ne 0 ]; then
    echo "$failures check(s) failed"
    exit 1
fi
echo "all checks passed"
