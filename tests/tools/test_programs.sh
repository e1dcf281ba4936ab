#!/usr/bin/env bash
# The programs' exit codes, help texts, default file names and failure
# handling, seen from the command line.
set -uo pipefail
src=${NLW_SRC:-$(cd "$(dirname "$0")/../.." && pwd)}
bin=${NLW_BIN:-$src/build}
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
fail=0

expect() {  # description expected-code command...
    local what=$1 want=$2; shift 2
    "$@" >"$work/out.txt" 2>"$work/err.txt"
    local got=$?
    if [ "$got" = "$want" ]; then echo "ok   $what"; else
        echo "FAIL $what: exit $got, expected $want"; cat "$work/out.txt" "$work/err.txt" | head -20; fail=1
    fi
}
contains() {  # description file text
    if grep -qF -- "$3" "$2"; then echo "ok   $1"; else echo "FAIL $1: '$3' not in output"; head -20 "$2"; fail=1; fi
}

yosys -q -p "read_verilog $src/tests/data/programs/top.v; synth -top top; write_json $work/top.json"

expect "qdb2ver -h exits 0" 0 "$bin/qdb2ver" -h
contains "qdb2ver -h prints the option lines" "$work/out.txt" "-aka                Write Also-Know-As names as comments."
expect "tessel -h exits 0" 0 "$bin/tessel" -h
contains "tessel -h prints the overview" "$work/out.txt" "Valid netlist_types are:"
expect "tessel -h sim exits 0" 0 "$bin/tessel" -h sim
contains "tessel -h sim prints the options" "$work/out.txt" "-ism                Include timcell modules in verilog file."
expect "no input file: usage, exit 2" 2 "$bin/qdb2ver"
contains "usage names the synopsis" "$work/err.txt" "qdb2ver [-10ps] [-aka]"
expect "unknown option: exit 2" 2 "$bin/qdb2ver" -nonsense "$work/top.json"
expect "missing option value: exit 2" 2 "$bin/tessel" "$work/top.json" -ecn
expect "missing design file: exit 2" 2 "$bin/qdb2ver" "$work/none.json"
contains "the message names the file" "$work/err.txt" "none.json"
printf '{"modules": {"top": {"ports": ' > "$work/bad.json"
expect "malformed design file: exit 2" 2 "$bin/qdb2ver" "$work/bad.json"
contains "the message names the file" "$work/err.txt" "bad.json"
[ -e "$work/bad.v" ] && { echo "FAIL a netlist appeared for a bad design"; fail=1; }

expect "a good design: exit 0" 0 "$bin/qdb2ver" "$work/top.json"
[ -s "$work/top.v.netlist" ] || true
if [ -s "$work/top.v" ] && grep -q "^ *module top" "$work/top.v"; then echo "ok   default output is the input root with .v"; else echo "FAIL default output file"; fail=1; fi
cp "$work/top.v" "$work/keep.v"
expect "existing output without -w: exit 1" 1 "$bin/qdb2ver" "$work/top.json"
if cmp -s "$work/top.v" "$work/keep.v"; then echo "ok   the existing file is kept"; else echo "FAIL the existing file changed"; fail=1; fi
expect "existing output with -w: exit 0" 0 "$bin/qdb2ver" -w "$work/top.json"
expect "unwritable directory: exit 1" 1 "$bin/qdb2ver" "$work/top.json" "$work/no/such/dir/x.v"

expect "flattened netlist: exit 0" 0 "$bin/qdb2ver" -fn -w "$work/top.json" "$work/flat.v"
if grep -q "module leaf" "$work/flat.v"; then echo "FAIL -fn kept the sub-module"; fail=1; else echo "ok   -fn leaves one module"; fi
datdir=${YOSYS_DATDIR:-/usr/share/yosys}
for f in top flat; do
    expect "iverilog reads $f.v" 0 iverilog -g2005 -o "$work/a.out" -s top "$work/$f.v" "$datdir/simcells.v"
    expect "yosys reads $f.v" 0 yosys -q -p "read_verilog $work/$f.v; hierarchy -top top"
done

cp "$work/top.v" "$work/first.v"
expect "a second run: exit 0" 0 "$bin/qdb2ver" -w "$work/top.json"
if cmp -s "$work/top.v" "$work/first.v"; then echo "ok   the same design gives the same bytes"; else echo "FAIL two runs differ"; fail=1; fi

expect "-tm renames the top module" 0 "$bin/qdb2ver" -w -tm chip "$work/top.json" "$work/chip.v"
contains "the module is named chip" "$work/chip.v" "module chip"

# The pin map: pad cells on the top-level ports, their package pins from the
# cell's PINNAME or LOC or from the LOC of the port's net. Without pad
# buffers the pad pins sit on the ports themselves; output pads drive
# nothing and are kept explicitly.
mkdir -p "$work/pins"
expect "rtl2json maps the pad design" 0 \
    "$src/flow/rtl2json" -noiopad -part vx100-fg256-5 chip "$work/pins/chip.json" "$src/tests/data/programs/chip.v"
expect "qdb2ver -pf writes the pin map" 0 "$bin/qdb2ver" -pf -w "$work/pins/chip.json"
contains "the pin file is announced" "$work/out.txt" "Writing pin file '$work/pins/chip.pin' ..."
contains "the pin file names the design" "$work/pins/chip.pin" "// Design name: chip"
contains "the part loses its family prefix" "$work/pins/chip.pin" "// Part 100"
for port in clk 'd[0]' 'd[1]' q z; do
    n=$(awk -F'\t' -v p="$port" 'NF == 3 { sub(/ +$/, "", $1); if ($1 == p) n++ } END { print n + 0 }' \
        "$work/pins/chip.pin")
    if [ "$n" = 1 ]; then echo "ok   port $port is listed once"; else
        echo "FAIL port $port is listed $n times"; cat "$work/pins/chip.pin"; fail=1; fi
done
lines=$(grep -c $'\t' "$work/pins/chip.pin")
if [ "$lines" = 5 ]; then echo "ok   one line per pad"; else echo "FAIL $lines pin lines, expected 5"; fail=1; fi
contains "a pad pin from the net's LOC" "$work/pins/chip.pin" "$(printf '%-20s\t%-10s\t%-10s' z INPUT P9)"
contains "an input pad's pin is an output" "$work/pins/chip.pin" "$(printf '%-20s\t%-10s\t%-10s' 'd[0]' OUTPUT P2)"

# The test fixture compiles together with the netlist it was written for.
expect "-tf writes a test fixture: exit 0" 0 "$bin/qdb2ver" -tf -w "$work/top.json" "$work/fixture.v"
if [ -s "$work/fixture.tv" ]; then echo "ok   the fixture is the netlist root with .tv"; else
    echo "FAIL no test fixture"; fail=1; fi
expect "iverilog compiles netlist and fixture" 0 iverilog -g2005 -o "$work/fixture.vvp" -s test \
    -s chipwide "$work/fixture.v" "$work/fixture.tv" "$datdir/simcells.v"
expect "the fixture simulates" 0 vvp -n "$work/fixture.vvp"
contains "the fixture prints its column header" "$work/out.txt" "           T "
exit $fail
