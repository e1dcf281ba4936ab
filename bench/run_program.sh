#!/usr/bin/env bash
# Whole-program benchmark: times qdb2ver reading each generated design and
# writing its netlist (end to end, as a user runs it). Per design: wall, user
# and system time, peak memory, page faults, output megabytes per second, the
# time per thousand cells (so that growth from 100k to 1M can be read off)
# and the stage times of the debug channel (read / prepare / write).
# Then the side-file writers (-tf, -pf, the translation file of -sta) on the
# largest yosys-layout design, and the timing file (-timing, with the SDF of
# bench/gen_sdf.py) on the largest compact design; its stage column has the
# timing reader's time between prepare and write. With --yosys it also times yosys read_json + write_verilog on the 100k
# designs for comparison.
#
# Usage: bench/run_program.sh [BUILD_DIR] [--yosys]
#   NLW_BENCH_SIZES="10000 100000" limits the sizes.
set -euo pipefail

here="$(cd "$(dirname "${BASH_SOURCE[0]}")" && pwd)"
build="${1:-build}"
yosys_too="${2:-}"
out="$(mktemp -d)"
trap 'rm -rf "$out"' EXIT

[ -x "$build/qdb2ver" ] || cmake --build "$build" -j2 --target qdb2ver >/dev/null
# shellcheck source=designs.sh
source "$here/designs.sh"

row() { printf '%-30s %8s %7s %7s %7s %8s %9s %8s %9s  %s\n' "$@"; }

measure() {  # label cells output command...: one table row
    local label=$1 cells=$2 output=$3; shift 3
    local log; log="$(mktemp)"
    rm -f "$output"
    if ! /usr/bin/time -f "%e %U %S %M %R %F" -o "$log" "$@" >/dev/null 2>"$out/err.txt"; then
        echo "run_program.sh: $label failed" >&2; tail -5 "$out/err.txt" >&2; exit 1
    fi
    local wall user sys kib minor major; read -r wall user sys kib minor major <"$log"; rm -f "$log"
    local bytes=0; [ -e "$output" ] && bytes=$(stat -c %s "$output")
    local mbs per stages
    mbs=$(awk -v b="$bytes" -v w="$wall" 'BEGIN { printf "%.0f", (w > 0 ? b / 1048576 / w : 0) }')
    per=$(awk -v w="$wall" -v n="$cells" 'BEGIN { printf "%.2f", w * 1000000 / n }')
    stages=$(sed -n 's/.*DEBUG: \(Reading\|Preparing\|Writing\)[a-z ]* took \([0-9.]*\) s.*/\2/p' "$out/err.txt" |
             paste -sd/ -)
    row "$label" "$cells" "$wall" "$user" "$sys" "$((kib / 1024))" "$((minor + major))" "$mbs" "$per" "${stages:--}"
}

row run cells "wall s" "user s" "sys s" "peak MiB" "faults" "out MB/s" "ms/1k" "read/prep/write s"
for entry in "${designs[@]}"; do
    IFS=: read -r name cells file <<<"$entry"
    measure "qdb2ver $name" "$cells" "$out/net.v" "$build/qdb2ver" -w -verbose "$file" "$out/net.v"
done
# The side files on the largest yosys-layout design, one option each: each
# row less the plain netlist row is the cost of that writer.
last=""
for entry in "${designs[@]}"; do case $entry in yosys_*) last=$entry ;; esac; done
if [ -n "$last" ]; then
    IFS=: read -r name cells file <<<"$last"
    measure "qdb2ver $name -tf" "$cells" "$out/net.v" "$build/qdb2ver" -w -verbose -tf "$file" "$out/net.v"
    measure "qdb2ver $name -pf" "$cells" "$out/net.v" "$build/qdb2ver" -w -verbose -pf "$file" "$out/net.v"
    measure "tessel -sta $name (pcs)" "$cells" "$out/net.v" "$build/tessel" -sta -w --verbose "$file" "$out/net.v"
fi
# The timing file on the largest compact design: the delays gen_sdf.py
# writes for it, read and written again (-timing). The row less the plain
# row of that design is the cost of reading and writing the timing file; its
# write stage less the plain row's write stage is the timing writer's.
last=""
for entry in "${designs[@]}"; do case $entry in gen_*) last=$entry ;; esac; done
if [ -n "$last" ]; then
    IFS=: read -r name cells file <<<"$last"
    sdf="${file%.json}.sdf"
    make_design "$sdf" python3 "$here/gen_sdf.py" "$cells"
    measure "qdb2ver $name -timing" "$cells" "$out/net.v" "$build/qdb2ver" -w -verbose \
        -timing "$sdf" "$file" "$out/net.v"
fi
if [ "$yosys_too" = "--yosys" ]; then
    for entry in "${designs[@]}"; do
        IFS=: read -r name cells file <<<"$entry"
        [ "$cells" = 100000 ] || continue
        measure "yosys $name" "$cells" "$out/y.v" \
            yosys -q -p "read_json $file; write_verilog -noattr $out/y.v"
    done
fi
