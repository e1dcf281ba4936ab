#!/usr/bin/env bash
# Every option of both programs, run on one small design: each row of
# tests/data/options/rows.txt checks the effect the option documents (a
# file, a line of a file, a message), and an option that can have no effect
# prints exactly its one warning.
source "$(dirname "$0")/lib.sh"
cp "$data/options/opt_ram.mem" "$data/options/opt_top.qcf" .
printf '12\nzz\n' > bad.mem
"$src/flow/rtl2json" -part vx100-fg256-5 top top.json "$data/options/opt_top.v" > /dev/null || exit 1
# The net w carries the attributes that put it into the translation file.
python3 - top.json <<'PY'
import json, sys
d = json.load(open(sys.argv[1]))
d["modules"]["top"]["netnames"]["w"]["attributes"].update({"USER_VISIBLE": "1", "hdlname": "w_user"})
json.dump(d, open(sys.argv[1], "w"))
PY

n=0
while IFS='|' read -r prog args test file text; do
    n=$((n + 1))
    dir=$work/row$n
    mkdir -p "$dir"
    cp top.json top.qdm "$dir/"
    case "$args" in -h*) design="" ;; *) design=top.json ;; esac
    (cd "$dir" && "$bin/$prog" $args $design) > "$dir/out.txt" 2>&1
    rc=$?
    case $test in
    has) check "$prog $args: $file has '$text'" has "$dir/$file" "$text" ;;
    not) check "$prog $args: $file lacks '$text'" eval '[ -s "$dir/$file" ] && lacks "$dir/$file" "$text"' ;;
    file) check "$prog $args: writes $file" test -s "$dir/$file" ;;
    out) check "$prog $args: says '$text'" has "$dir/out.txt" "$text" ;;
    noout) check "$prog $args: does not say '$text'" lacks "$dir/out.txt" "$text" ;;
    fails) check "$prog $args: fails with '$text'" eval '[ $rc != 0 ] && has "$dir/out.txt" "$text"' ;;
    warn) check "$prog $args: one warning, '$text'" eval '[ "$(grep -c WARNING "$dir/out.txt")" = 1 ] &&
        grep WARNING "$dir/out.txt" | grep -qF -- "$text"' ;;
    esac
done < <(grep -v '^#' "$data/options/rows.txt")

# -w: an existing netlist is replaced only when asked (and, as this program
# did not write it, only when named).
mkdir -p w && cp top.json w/ && echo old > w/top.v
(cd w && "$bin/tessel" top.json) > /dev/null 2>&1
check "without -w the netlist is kept" grep -qx old w/top.v
(cd w && "$bin/qdb2ver" -w top.json top.v) > /dev/null 2>&1
check "-w replaces it" has w/top.v "module top"
finish
