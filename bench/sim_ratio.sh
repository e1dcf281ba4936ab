#!/usr/bin/env bash
# Gate-level against RTL simulation time in Icarus Verilog on the CPU-like
# test design (tests/data/designs/cpu_bus.v, register file, ALU and bus,
# W=8 unless told otherwise): flow/rtl2json, qdb2ver -ism with the timing
# models, one random-stimulus bench for both, the best of three runs of
# each. Prints the CPU seconds of each simulation and their ratio, for the
# flow's netlist (single-bit nets below the top) and for the one of
# rtl2json -keepbuses, and stops if a netlist's outputs differ from the RTL's.
#
# Usage: bench/sim_ratio.sh [BUILD_DIR] [CYCLES] [INSTALLATION] [FLOW_OPTIONS]
#   INSTALLATION: another installation's models (VORNIX), to compare model
#   versions; the default is the tree's share/.
#   FLOW_OPTIONS: rtl2json options, as "-P W=32 -P NREG=16 -lut 4" (default
#   "-P W=8"); the RTL gets the same parameters.
set -euo pipefail

here="$(cd "$(dirname "${BASH_SOURCE[0]}")" && pwd)"
src="$(cd "$here/.." && pwd)"
build="${1:-build}"
cycles="${2:-20000}"
models="${3:-$src/share}"
read -r -a flow_options <<<"${4:--P W=8}"
params=()
for i in "${!flow_options[@]}"; do
    [ "${flow_options[i]}" = -P ] && params+=("${flow_options[i + 1]}")
done
out="$(mktemp -d)"
trap 'rm -rf "$out"' EXIT

[ -x "$build/qdb2ver" ] || cmake --build "$build" -j2 --target qdb2ver >/dev/null
design="$src/tests/data/designs/cpu_bus.v"
lib="$src/tests/tools/lib"

"$src/flow/rtl2json" "${flow_options[@]}" cpu_bus "$out/cpu.json" "$design" >/dev/null
"$src/flow/rtl2json" -keepbuses "${flow_options[@]}" cpu_bus "$out/buses.json" "$design" >/dev/null
python3 "$lib/make_tb.py" "$out/cpu.json" cpu_bus "$cycles" 1 >"$out/tb.v"
python3 "$lib/make_tb.py" "$out/cpu.json" cpu_bus "$cycles" 1 "${params[@]}" >"$out/rtl_tb.v"
iverilog -g2005 -o "$out/rtl.vvp" -s nlw_tb "$out/rtl_tb.v" "$design"
for n in cpu buses; do
    VORNIX="$models" "$build/qdb2ver" -ism -quiet -w "$out/$n.json" "$out/$n.v" >/dev/null
    iverilog -g2005 -o "$out/$n.vvp" -s nlw_tb -s chipwide "$out/tb.v" "$out/$n.v"
done

best() {  # vvp file: the least user CPU seconds of three runs
    local b="" t i
    for i in 1 2 3; do
        /usr/bin/time -f "%U" -o "$out/t" vvp -n "$1" >"$out/log.$i"
        t=$(cat "$out/t")
        if [ -z "$b" ] || awk -v t="$t" -v b="$b" 'BEGIN { exit !(t < b) }'; then b=$t; fi
    done
    echo "$b"
}
rtl=$(best "$out/rtl.vvp")
cp "$out/log.1" "$out/rtl.log"
cells=$(grep '^  V_' "$out/cpu.v" | grep -vc '^  V_LUT[0-9]_T[0-9] ' || true)
for n in cpu buses; do
    net=$(best "$out/$n.vvp")
    python3 "$lib/compare_sim.py" "$out/rtl.log" "$out/log.1" >/dev/null ||
        { echo "sim_ratio.sh: the $n netlist's outputs differ from the RTL's" >&2; exit 1; }
    printf 'cpu_bus %s%s, %s cells, %s cycles: RTL %s s, gate level %s s, ratio %s\n' \
        "${flow_options[*]}" "$([ $n = buses ] && echo ' -keepbuses' || true)" "$cells" "$cycles" "$rtl" "$net" \
        "$(awk -v r="$rtl" -v n="$net" 'BEGIN { printf "%.1f", (r > 0) ? n / r : 0 }')"
done
