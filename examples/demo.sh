#!/usr/bin/env bash
# Writes the netlist of the shipped example design into out/ and says where.
set -euo pipefail
build=${1:-build}
here=$(cd "$(dirname "$0")/.." && pwd)
mkdir -p "$here/out"
design="$here/examples/counter/counter.json"
"$here/$build/qdb2ver" -w -ism "$design" "$here/out/counter.v"
echo
echo "Netlist written: out/counter.v ($(wc -l < "$here/out/counter.v") lines)"
echo "Simulate it with: iverilog -g2005 -o out/counter.vvp out/counter.v examples/counter/counter_tb.v && vvp out/counter.vvp"
