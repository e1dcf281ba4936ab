#!/usr/bin/env bash
# Design map and assertion files: flow/rtl2json writes the design map of a
# design whose registers yosys removes as constant and merges; tessel -ecn
# <tool> -qdm writes a record for each; yosys proves every constant-register
# record on the RTL and every netlist name is declared in the netlist;
# without -qdm there is no file and no message; a bad design map gives one
# error naming it, exit code 2 and no files.
source "$(dirname "$0")/lib.sh"
check "flow/rtl2json writes a design map" eval "'$src/flow/rtl2json' regs regs.json '$data/assert/regs.v' && [ -f regs.qdm ]"
for kind in constant merged renamed; do
    check "the design map has a $kind record" has regs.qdm "\"kind\": \"$kind\""
done
mkdir f c n
check "tessel -ecn formality" "$bin/tessel" -ecn formality -qdm regs.qdm -w regs.json f/regs.v
check "tessel -ecn conformal" "$bin/tessel" -ecn conformal -qdm regs.qdm -w regs.json c/regs.v
records=$(grep -c '"kind"' regs.qdm)
check "one line per design map record" eval '[ "$(grep -vc "^#" f/regs.svf)" = $records ] &&
    [ "$(grep -vc "^//" c/regs.vxc)" = $records ]'
check "proven on the RTL, names in the netlist" python3 "$tools/assert/check_assertions.py" \
    f/regs.svf "$data/assert/regs.v" f/regs.v "$work"
check "without -qdm no assertion file and no message" eval '"$bin/tessel" --debug -ecn formality -w regs.json \
    n/regs.v > n.log 2>&1 && [ "$(ls n)" = regs.v ] && ! grep -q -i -e assertion -e "Key :" n.log'

# Bad design maps: the file and the expected message, each on its own run.
flop=$(sed -n 's/.*"into": "\([^"]*\)".*/\1/p' regs.qdm | head -n 1)
head='{"format": "nlw-design-map", "version": 1, "records": ['
printf '{"format": "nlw-design-map", "version": 1,' > notjson.qdm
printf '{"format": "nlw-design-map", "version": 2, "records": []}' > version.qdm
echo "$head"'{"kind": "merged", "module": "unit", "register": "b[0]", "into": "nope"}]}' > register.qdm
echo "$head"'{"kind": "merged", "module": "nomod", "register": "b", "into": "'"$flop"'"}]}' > module.qdm
while IFS='|' read -r file message; do
    rm -rf b && mkdir b
    check "$file: exit 2" run 2 "$bin/tessel" -ecn formality -qdm "$file" -w regs.json b/regs.v
    check "$file: one error, '$message'" eval '[ "$(grep -c ERROR out.txt)" = 1 ] && grep -q "ERROR.*$file: $message" out.txt'
    check "$file: no files" test -z "$(ls -A b)"
done << 'CASES'
notjson.qdm|not a design map file: malformed JSON
version.qdm|design map version 2 is not supported
register.qdm|record 0: unknown register 'nope' in module 'unit'
module.qdm|record 0: unknown module 'nomod'
missing.qdm|cannot read the design map file
CASES
finish
