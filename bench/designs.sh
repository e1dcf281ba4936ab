# Sourced by the benchmark scripts: makes the generated designs in bench/data/
# once (they are kept) and lists them in the array "designs" as
# "name:cells:file" entries, smallest first within each family.
#   gen     the compact generated family (gen_design.py)
#   yosys   yosys's exact layout with src attributes, internal and escaped
#           names, constants, bit-mixed connections, a module used twice
#           (gen_yosys_design.py)
#   cpu     a small CPU synthesized by yosys from bench/rtl/minicpu.v,
#           replicated as uniquified modules (gen_replicated.py)
bench_dir="$(cd "$(dirname "${BASH_SOURCE[0]}")" && pwd)"
data="$bench_dir/data"
sizes=(${NLW_BENCH_SIZES:-10000 100000 1000000})
designs=()

mkdir -p "$data"
make_design() {  # file command...: runs the command to write file.tmp once
    local file=$1; shift
    if [ ! -s "$file" ]; then
        "$@" "$file.tmp" >/dev/null || { echo "designs.sh: cannot make $file" >&2; exit 1; }
        mv "$file.tmp" "$file"
    fi
}
cpu_json="$data/minicpu.json"
if [ ! -s "$cpu_json" ]; then
    VORNIX= "$bench_dir/../flow/rtl2json" -noiopad -keepbuses minicpu "$cpu_json.tmp" "$bench_dir/rtl/minicpu.v" >/dev/null &&
        mv "$cpu_json.tmp" "$cpu_json"
fi
for n in "${sizes[@]}"; do
    make_design "$data/design_$n.json" python3 "$bench_dir/gen_design.py" "$n"
    designs+=("gen_$n:$n:$data/design_$n.json")
done
for n in "${sizes[@]}"; do
    make_design "$data/yosys_$n.json" python3 "$bench_dir/gen_yosys_design.py" "$n"
    designs+=("yosys_$n:$n:$data/yosys_$n.json")
done
if [ -s "$cpu_json" ]; then
    for n in "${sizes[@]}"; do
        make_design "$data/cpu_$n.json" python3 "$bench_dir/gen_replicated.py" "$cpu_json" minicpu "$n"
        designs+=("cpu_$n:$n:$data/cpu_$n.json")
    done
fi
