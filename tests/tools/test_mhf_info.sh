#!/usr/bin/env bash
# The hierarchy information file of a multiple-hierarchy netlist is enough
# to use the netlist: a three-level design (one module type used twice, two
# types that differ only in case)
# goes through flow/rtl2json and tessel -sim -mhf; the file list built from the information file alone compiles in
# Icarus Verilog and simulates cycle by cycle like the single-file netlist;
# every module block is listed once with its path, module and parent, and
# every file named exists.
set -uo pipefail
src=${NLW_SRC:-$(cd "$(dirname "$0")/../.." && pwd)}
bin=${NLW_BIN:-$src/build}
lib="$src/tests/tools/lib"
data="$src/tests/tools/mhf"
work=$(mktemp -d "${TMPDIR:-/tmp}/nlw_mhf.XXXXXX") || exit 1
trap 'rm -rf "$work"' EXIT
unset VORNIX
export NLW_TIMESTAMP="Thu Jan  1 00:00:00 2026"
fail=0
bad() {
    echo "FAIL $*"
    fail=1
}
show() { sed -n '1,30p' "$1" | sed 's/^/    /'; }

cd "$work" || exit 1
if ! "$src/flow/rtl2json" hier3 hier3.json "$data/hier3.v" > flow.log 2>&1; then
    bad "flow/rtl2json"
    show flow.log
    exit 1
fi
mkdir single mhf
if ! "$bin/tessel" -sim -ism -w hier3.json single/hier3.v > single.log 2>&1 ||
    ! "$bin/tessel" -sim -mhf -ism -w hier3.json mhf/hier3.v > mhf.log 2>&1; then
    bad "tessel"
    show single.log
    show mhf.log
    exit 1
fi
info=mhf/hier3_mhf_info.txt
grep -q "^Writing hierarchy information file '$info' \.\.\.$" mhf.log ||
    bad "no status message for the information file"

# The blocks: path, module and parent, each once.
awk -F '\t' '$1 == "block" { print $2 "\t" $3 "\t" $6 }' "$info" | sort > blocks.txt
if diff <(sort "$data/blocks.txt") blocks.txt > blocks.diff; then
    echo "ok   every module block once with its path, module and parent"
else
    bad "block records differ from the design"
    show blocks.diff
fi

# The file set: the top's file, every block's netlist file, the shared files.
awk -F '\t' '$1 == "top" { print $3 } $1 == "block" { print $4 } $1 == "shared" { print $3 }' \
    "$info" | sort -u > files.txt
missing=0
while read -r f; do
    [ -f "$f" ] || { bad "the information file names '$f', which does not exist"; missing=1; }
done < files.txt
[ "$missing" = 0 ] && echo "ok   $(wc -l < files.txt) files named, all exist"

python3 "$lib/make_tb.py" hier3.json hier3 200 7 > tb.v
mapfile -t set < files.txt
if iverilog -g2005 -o single.vvp -s nlw_tb -s chipwide tb.v single/hier3.v > single_build.log 2>&1 &&
    iverilog -g2005 -o mhf.vvp -s nlw_tb -s chipwide tb.v "${set[@]}" > mhf_build.log 2>&1; then
    vvp -n single.vvp > single_sim.log 2>&1
    vvp -n mhf.vvp > mhf_sim.log 2>&1
    if [ "$(grep -c '^[0-9]' mhf_sim.log)" -gt 100 ] && diff single_sim.log mhf_sim.log > sim.diff; then
        echo "ok   the file set from the information file simulates like the single netlist"
    else
        bad "simulations differ"
        show sim.diff
    fi
else
    bad "compiling the file set"
    show single_build.log
    show mhf_build.log
fi
exit $fail
