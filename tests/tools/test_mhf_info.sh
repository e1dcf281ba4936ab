#!/usr/bin/env bash
# The hierarchy information file of a multiple-hierarchy netlist is enough
# to use the netlist: a three-level design (one module type used twice, two
# types that differ only in case) goes through flow/rtl2json and tessel -sim
# -mhf; every module block is listed once with its path, module and parent,
# every file named exists, and the file list built from the information file
# alone compiles in Icarus Verilog and simulates cycle by cycle exactly like
# the single-file netlist.
source "$(dirname "$0")/lib.sh"
check "flow/rtl2json" "$src/flow/rtl2json" hier3 hier3.json "$data/mhf/hier3.v"
mkdir single mhf
check "tessel" "$bin/tessel" -sim -ism -w hier3.json single/hier3.v
check "tessel -mhf" run 0 "$bin/tessel" -sim -mhf -ism -w hier3.json mhf/hier3.v
info=mhf/hier3_mhf_info.txt
check "the status message for the information file" grep -qx "Writing hierarchy information file '$info' \.\.\." out.txt
check "every module block once with its path, module and parent" \
    diff <(sort "$data/mhf/blocks.txt") <(awk -F '\t' '$1 == "block" { print $2 "\t" $3 "\t" $6 }' "$info" | sort)
awk -F '\t' '$1 == "top" { print $3 } $1 == "block" { print $4 } $1 == "shared" { print $3 }' "$info" |
    sort -u > files.txt
check "the $(wc -l < files.txt) files named exist" eval '! while read -r f; do [ -f "$f" ] || echo "missing $f"; done < files.txt | grep .'
python3 "$tools/lib/make_tb.py" hier3.json hier3 200 7 > tb.v
check "the file set simulates like the single netlist" eval 'iverilog -g2005 -o single.vvp -s nlw_tb -s chipwide \
    tb.v single/hier3.v && iverilog -g2005 -o mhf.vvp -s nlw_tb -s chipwide tb.v $(cat files.txt) &&
    vvp -n single.vvp > single.log && vvp -n mhf.vvp > mhf.log &&
    [ "$(grep -c "^[0-9]" mhf.log)" -gt 100 ] && diff single.log mhf.log'
finish
