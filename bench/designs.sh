# Sourced by the benchmark scripts: makes the generated designs of about 10k,
# 100k and 1M cells in bench/data/ once (they are kept) and lists them in
# the array "sizes".
bench_dir="$(cd "$(dirname "${BASH_SOURCE[0]}")" && pwd)"
data="$bench_dir/data"
sizes=(10000 100000 1000000)

mkdir -p "$data"
for n in "${sizes[@]}"; do
    file="$data/design_$n.json"
    if [ ! -s "$file" ]; then
        python3 "$bench_dir/gen_design.py" "$n" "$file.tmp" >/dev/null
        mv "$file.tmp" "$file"
    fi
done
