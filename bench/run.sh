#!/usr/bin/env bash
# Load benchmark: makes designs of about 10k, 100k and 1M cells in
# bench/data/ (once; they are kept) and times loading each with the
# nlw_load_bench program of a build directory, printing one table row per
# design: the load time the program measures, the whole run's wall time and
# its peak memory.
#
# Usage: bench/run.sh [BUILD_DIR] [extra nlw_load_bench options, e.g. --flatten]
# BUILD_DIR defaults to "build"; a Release build gives meaningful figures.
set -euo pipefail

here="$(cd "$(dirname "${BASH_SOURCE[0]}")" && pwd)"
build="${1:-build}"
shift || true
bin="$build/nlw_load_bench"

if [ ! -x "$bin" ]; then
    cmake --build "$build" -j2 --target nlw_load_bench >/dev/null
fi
if [ ! -x /usr/bin/time ]; then
    echo "run.sh: /usr/bin/time is needed to measure peak memory" >&2
    exit 1
fi

# shellcheck source=designs.sh
source "$here/designs.sh"

printf '%-10s %9s %10s %10s %12s  %s\n' cells "file MiB" "load s" "wall s" "peak MiB" options
for n in "${sizes[@]}"; do
    file="$data/design_$n.json"
    log="$(mktemp)"
    if ! /usr/bin/time -f "%e s %M KiB" -o "$log" "$bin" "$@" "$file" >"$log.out"; then
        echo "run.sh: loading $file failed" >&2
        cat "$log.out" >&2
        rm -f "$log" "$log.out"
        exit 1
    fi
    load="$(sed -n 's/.*: load \([0-9.]*\) s.*/\1/p' "$log.out")"
    read -r wall _ kib _ <"$log"
    size=$(( $(stat -c %s "$file") / 1048576 ))
    printf '%-10s %9s %10s %10s %12s  %s\n' "$n" "$size" "$load" "$wall" "$((kib / 1024))" "$*"
    rm -f "$log" "$log.out"
done
