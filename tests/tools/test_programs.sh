#!/usr/bin/env bash
# The programs' exit codes, default file names and failure handling, seen
# from the command line (each option's effect: test_options.sh).
source "$(dirname "$0")/lib.sh"
yosys -q -p "read_verilog $data/programs/top.v; synth -top top; write_json top.json"
q=$bin/qdb2ver

check "tessel -h prints the overview" run 0 "$bin/tessel" -h
check "... Valid netlist_types" has out.txt "Valid netlist_types are:"
check "no input file: usage, exit 2" run 2 "$q"
check "usage names the synopsis" has out.txt "qdb2ver [-10ps] [-aka]"
check "unknown option: exit 2" run 2 "$q" -nonsense top.json
check "missing option value: exit 2" run 2 "$bin/tessel" top.json -ecn
check "missing design file: exit 2" run 2 "$q" none.json
check "the message names the file" has out.txt none.json
printf '{"modules": {"top": {"ports": ' > bad.json
check "malformed design file: exit 2" run 2 "$q" bad.json
check "the message names the file" has out.txt bad.json
check "no netlist for a bad design" test ! -e bad.v

check "a good design: exit 0" run 0 "$q" top.json
check "default output is the input root with .v" grep -q "^ *module top" top.v
cp top.v keep.v
check "existing output without -w: exit 1" run 1 "$q" top.json
check "the existing file is kept" cmp top.v keep.v
check "existing output with -w: exit 0" run 0 "$q" -w top.json
check "unwritable directory: exit 1" run 1 "$q" top.json no/such/dir/x.v
check "flattened netlist: exit 0" run 0 "$q" -fn -w top.json flat.v
check "-fn leaves one module" lacks flat.v "module leaf"
for f in top flat; do
    check "iverilog reads $f.v" iverilog -g2005 -o a.out -s top $f.v "$datdir/simcells.v"
    check "yosys reads $f.v" yosys -q -p "read_verilog $f.v; hierarchy -top top"
done
cp top.v first.v
"$q" -w top.json > /dev/null 2>&1
check "the same design gives the same bytes" cmp top.v first.v

# The pin map: pad cells on the top-level ports, their package pins from the
# cell's PINNAME or LOC or from the LOC of the port's net. Without pad
# buffers the pad pins sit on the ports themselves; output pads drive
# nothing and are kept explicitly.
mkdir -p pins
check "rtl2json maps the pad design" "$src/flow/rtl2json" -noiopad -part vx100-fg256-5 chip pins/chip.json \
    "$data/programs/chip.v"
check "qdb2ver -pf writes the pin map" run 0 "$q" -pf -w pins/chip.json
check "the pin file is announced" has out.txt "Writing pin file 'pins/chip.pin' ..."
check "the pin file names the design" has pins/chip.pin "// Design name: chip"
check "the part loses its family prefix" has pins/chip.pin "// Part 100"
for port in clk 'd[0]' 'd[1]' q z; do
    check "port $port is listed once" test "$(awk -F'\t' -v p="$port" 'NF == 3 { sub(/ +$/, "", $1)
        if ($1 == p) n++ } END { print n + 0 }' pins/chip.pin)" = 1
done
check "one line per pad" test "$(grep -c $'\t' pins/chip.pin)" = 5
check "a pad pin from the net's LOC" has pins/chip.pin "$(printf '%-20s\t%-10s\t%-10s' z INPUT P9)"
check "an input pad's pin is an output" has pins/chip.pin "$(printf '%-20s\t%-10s\t%-10s' 'd[0]' OUTPUT P2)"

# The test fixture compiles together with the netlist it was written for.
check "-tf writes a test fixture, the netlist root with .tv" eval "'$q' -tf -w top.json fixture.v > tf.txt 2>&1 &&
    test -s fixture.tv"
check "the fixture is announced" has tf.txt "Writing Verilog test file 'fixture.tv' ..."
check "iverilog compiles netlist and fixture" iverilog -g2005 -o fixture.vvp -s test -s chipwide fixture.v \
    fixture.tv "$datdir/simcells.v"
check "the fixture simulates" run 0 vvp -n fixture.vvp
check "the fixture prints its column header" has out.txt "           T "
finish
