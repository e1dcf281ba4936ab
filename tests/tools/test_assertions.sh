#!/usr/bin/env bash
# Design map and assertion files: flow/rtl2json writes the design map of a
# design whose registers yosys removes as constant and merges; tessel -ecn
# <tool> -qdm writes a record for each; yosys proves every constant-register
# record on the RTL and every netlist name is declared in the netlist;
# without -qdm there is no file and no message; a bad design map gives one
# error naming it, exit code 2 and no files.
set -uo pipefail
src=${NLW_SRC:-$(cd "$(dirname "$0")/../.." && pwd)}
bin=${NLW_BIN:-$src/build}
data="$src/tests/tools/assert"
work=$(mktemp -d "${TMPDIR:-/tmp}/nlw_assert.XXXXXX") || exit 1
trap 'rm -rf "$work"' EXIT
unset VORNIX
export NLW_TIMESTAMP="Thu Jan  1 00:00:00 2026"
fail=0
bad() {
    echo "FAIL $*"
    fail=1
}
show() { sed -n '1,30p' "$1" | sed 's/^/    /'; }

cd "$work" || exit 1
if ! "$src/flow/rtl2json" regs regs.json "$data/regs.v" > flow.log 2>&1 || [ ! -f regs.qdm ]; then
    bad "flow/rtl2json wrote no design map"
    show flow.log
    exit 1
fi
for kind in constant merged renamed; do
    grep -q "\"kind\": \"$kind\"" regs.qdm || bad "the design map has no $kind record"
done

mkdir f c n
"$bin/tessel" -ecn formality -qdm regs.qdm -w regs.json f/regs.v > f.log 2>&1 || bad "tessel -ecn formality"
"$bin/tessel" -ecn conformal -qdm regs.qdm -w regs.json c/regs.v > c.log 2>&1 || bad "tessel -ecn conformal"
if [ -f f/regs.svf ] && [ -f c/regs.vxc ]; then
    records=$(grep -c '"kind"' regs.qdm)
    [ "$(grep -vc '^#' f/regs.svf)" = "$records" ] && [ "$(grep -vc '^//' c/regs.vxc)" = "$records" ] ||
        bad "not one line per design map record"
    if python3 "$data/check_assertions.py" f/regs.svf "$data/regs.v" f/regs.v "$work" > check.log 2>&1; then
        echo "ok   $(cat check.log): proven on the RTL, names in the netlist"
    else
        bad "assertion file"
        show check.log
    fi
else
    bad "no assertion file"
fi

"$bin/tessel" --debug -ecn formality -w regs.json n/regs.v > n.log 2>&1 || bad "tessel without -qdm"
if ls n | grep -q -v '^regs\.v$' || grep -q -i -e 'assertion' -e 'Key :' n.log; then
    bad "without -qdm: a file or a message"
else
    echo "ok   without -qdm no assertion file and no message"
fi

# Bad design maps: the file, the expected message, each on its own run.
flop=$(sed -n 's/.*"into": "\([^"]*\)".*/\1/p' regs.qdm | head -n 1)
printf '{"format": "nlw-design-map", "version": 1, "records": [\n' > head.txt
printf '{"format": "nlw-design-map", "version": 1,' > notjson.qdm
printf '{"format": "nlw-design-map", "version": 2, "records": []}' > version.qdm
{ cat head.txt; echo '{"kind": "merged", "module": "unit", "register": "b[0]", "into": "nope"}]}'; } \
    > register.qdm
{ cat head.txt; echo "{\"kind\": \"merged\", \"module\": \"nomod\", \"register\": \"b\", \"into\": \"$flop\"}]}"; } \
    > module.qdm
while IFS='|' read -r file message; do
    rm -rf b && mkdir b
    "$bin/tessel" -ecn formality -qdm "$file" -w regs.json b/regs.v > b.log 2>&1
    code=$?
    errors=$(grep -c 'ERROR' b.log)
    if [ "$code" != 2 ] || [ "$errors" != 1 ] || ! grep -q "ERROR.*$file: $message" b.log ||
        [ -n "$(ls -A b)" ]; then
        bad "$file: exit $code, $errors errors, files: $(ls -A b | tr '\n' ' ')"
        show b.log
    else
        echo "ok   $(grep -m1 ERROR b.log | sed 's/^ERROR:NetListWriters - //')"
    fi
done << 'CASES'
notjson.qdm|not a design map file: malformed JSON
version.qdm|design map version 2 is not supported
register.qdm|record 0: unknown register 'nope' in module 'unit'
module.qdm|record 0: unknown module 'nomod'
missing.qdm|cannot read the design map file
CASES
exit $fail
