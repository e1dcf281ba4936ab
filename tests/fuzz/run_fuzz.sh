#!/usr/bin/env bash
# Builds the seed corpus (the example designs, the reader's test designs and
# the test designs mapped by rtl2json) and runs the fuzz target.
#   run_fuzz.sh BUILD_DIR [SECONDS] [libFuzzer options...]
# Crashes and sanitizer reports land in BUILD_DIR/fuzz-findings.
set -eu
src=$(cd "$(dirname "$0")/../.." && pwd)
build=$(cd "$1" && pwd)
seconds=${2:-60}
shift $(( $# < 2 ? $# : 2 ))
seeds=$build/fuzz-seeds
corpus=$build/fuzz-corpus
findings=$build/fuzz-findings
mkdir -p "$seeds" "$corpus" "$findings"
if [ -z "$(ls -A "$seeds")" ]; then
    cp "$src"/examples/*/*.json "$src"/tests/data/*/*.json "$seeds"/ 2>/dev/null || true
    cp "$src"/tests/fuzz/seeds/*.json "$seeds"/ 2>/dev/null || true
    if command -v yosys >/dev/null; then
        for v in "$src"/tests/data/designs/*.v; do
            top=$(basename "$v" .v)
            "$src/flow/rtl2json" "$top" "$seeds/$top.json" "$v" >/dev/null 2>&1 || true
        done
    fi
fi
cd "$findings"
exec "$build/nlw_fuzz_design" -max_total_time="$seconds" -max_len=65536 -timeout=20 \
    -rss_limit_mb=2048 -print_final_stats=1 "$@" "$corpus" "$seeds"
