#!/usr/bin/env bash
# Whole-program benchmark: times qdb2ver reading each generated design and
# writing its netlist (end to end, as a user runs it), with peak memory, and
# the time per thousand cells so that growth from 100k to 1M can be read off.
# With --yosys it also times yosys read_json + write_verilog on the 100k
# design for comparison.
#
# Usage: bench/run_program.sh [BUILD_DIR] [--yosys]
set -euo pipefail

here="$(cd "$(dirname "${BASH_SOURCE[0]}")" && pwd)"
build="${1:-build}"
yosys_too="${2:-}"
out="$(mktemp -d)"
trap 'rm -rf "$out"' EXIT

[ -x "$build/qdb2ver" ] || cmake --build "$build" -j2 --target qdb2ver >/dev/null
# shellcheck source=designs.sh
source "$here/designs.sh"

measure() {  # label cells command...: one table row
    local label=$1 cells=$2; shift 2
    local log; log="$(mktemp)"
    if ! /usr/bin/time -f "%e %M" -o "$log" "$@" >/dev/null 2>"$out/err.txt"; then
        echo "run_program.sh: $label failed" >&2; cat "$out/err.txt" >&2; exit 1
    fi
    local wall kib; read -r wall kib <"$log"; rm -f "$log"
    local per; per=$(awk -v w="$wall" -v n="$cells" 'BEGIN { printf "%.2f", w * 1000000 / n }')
    printf '%-28s %10s %8s %10s %14s\n' "$label" "$cells" "$wall" "$((kib / 1024))" "$per"
}

printf '%-28s %10s %8s %10s %14s\n' run cells "wall s" "peak MiB" "ms/1k cells"
for n in "${sizes[@]}"; do
    measure "qdb2ver $n" "$n" "$build/qdb2ver" -w -quiet "$data/design_$n.json" "$out/net.v"
done
if [ "$yosys_too" = "--yosys" ]; then
    measure "yosys read_json+write_verilog 100000" 100000 \
        yosys -q -p "read_json $data/design_100000.json; write_verilog -noattr $out/y.v"
fi
