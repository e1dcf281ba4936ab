#!/usr/bin/env bash
# Files handled safely: nothing written outside the output folder, no input
# or foreign file destroyed, exclusive temporaries, all-or-nothing runs,
# killed runs, and inputs that change or never end.
source "$(dirname "$0")/lib.sh"
# check DESCRIPTION CONDITION
cond() { check "$1" eval "$2"; }
# The exit code of a run (stderr in err.txt).
code() { "$@" > out.txt 2> err.txt; echo $?; }
said() { grep -qF -- "$1" err.txt; }
temps() { find "$1" -name '*.tmp[0-9]*' | wc -l; }

yosys -q -p "read_verilog $data/filesafe/rtl.v; synth -top top; write_json top.json"
cp "$data/filesafe/rtl.v" .
# Module names that lead out of the folder, hold blanks and slashes, differ
# only in case or name the run's own files.
cp "$data/filesafe/hostile.json" .
mkdir -p deep/out
cond "-mhf with hostile module names: exit 0" '[ "$(code "$bin/tessel" -sim -mhf -ism hostile.json deep/out/net.v)" = 0 ]'
cond "every module file is inside the output folder" \
    '[ "$(find . -newer hostile.json -name "*.v" ! -path "./deep/out/*" | wc -l)" = 0 ]'
cond "one file per module, chipwide, the model and hierarchy files apart" \
    '[ "$(ls deep/out/*.v | wc -l)" = 10 ] && [ -s deep/out/chipwide.v ] && [ -s deep/out/net_ism.v ]'
cond "-tm with a path as module name stays inside too" \
    '[ "$(code "$bin/tessel" -sim -mhf -w -tm ../../x top.json deep/out/t.v)" = 0 ] && [ ! -e x.v ] && [ ! -e ../x.v ]'

# No input destroyed: each refusal comes before anything is written.
cp top.json keep.json
cond "-log onto the design: exit 2" '[ "$(code "$bin/qdb2ver" -log top.json top.json)" = 2 ]'
cond "the message names both files" 'said "Log file '"'"'top.json'"'"' is the design file"'
ln -s top.json link.v
cond "output onto the design (through a link): exit 2" '[ "$(code "$bin/qdb2ver" -w top.json link.v)" = 2 ]'
cp top.json side.pin
cond "a side file onto the design: exit 1" '[ "$(code "$bin/qdb2ver" -w -pf side.pin side.v)" = 1 ] && [ ! -e side.v ]'
cp top.json dump.nlw
cond "NLW_WRITE_NLWFILE onto the design: exit 1" \
    '[ "$(NLW_WRITE_NLWFILE=1 code "$bin/qdb2ver" -w dump.nlw dump.v)" = 1 ]'
cond "every input is unchanged" 'cmp -s top.json keep.json && cmp -s side.pin keep.json && cmp -s dump.nlw keep.json'

# -w replaces only files the user named or files this program wrote.
mkdir rtlsrc && cp rtl.v rtlsrc/top.v && cp top.json rtlsrc/top.json
cond "-w over an RTL source at the default name: exit 1" \
    '[ "$(code "$bin/qdb2ver" -w rtlsrc/top.json)" = 1 ] && cmp -s rtlsrc/top.v rtl.v'
cond "the message names the file and what to do" 'said "rtlsrc/top.v'"'"' exists and was not written by this program" && said "Move it away"'
mkdir mh && cp rtl.v mh/leaf.v
cond "-mhf -w over a user's module-named file: exit 1, nothing written" \
    '[ "$(code "$bin/tessel" -sim -mhf -w top.json mh/net.v)" = 1 ] && cmp -s mh/leaf.v rtl.v && [ "$(ls mh)" = leaf.v ]'
cond "a file this program wrote is replaced with -w" \
    '[ "$(code "$bin/qdb2ver" -w top.json own.v)" = 0 ] && [ "$(code "$bin/qdb2ver" -w top.json own.v)" = 0 ]'
chmod 640 own.v
cond "the replaced file keeps its mode" \
    '[ "$(code "$bin/qdb2ver" -w top.json own.v)" = 0 ] && [ "$(stat -c %a own.v)" = 640 ]'
ln -s nowhere/x.v dangling.v
cond "a dangling link as output without -w: exit 1" \
    '[ "$(code "$bin/qdb2ver" top.json dangling.v)" = 1 ] && [ -L dangling.v ] && [ ! -e nowhere ]'

# A link planted at the temporary's name is neither followed nor removed.
echo victim > victim.txt
(ln -s victim.txt planted.v.tmp$BASHPID && exec "$bin/qdb2ver" top.json planted.v >/dev/null 2>&1)
cond "a planted link at the temporary: the victim is untouched" \
    '[ "$(cat victim.txt)" = victim ] && [ -L planted.v.tmp* ] && grep -q "module top" planted.v'

# Two runs without -w on one name: exactly one creates it.
mkdir race
twice=0
for i in $(seq 200); do
    rm -f race/top.v
    "$bin/qdb2ver" top.json race/top.v >/dev/null 2>&1 & a=$!
    "$bin/qdb2ver" top.json race/top.v >/dev/null 2>&1 & b=$!
    wait $a; ra=$?; wait $b; rb=$?
    [ "$((ra + rb))" = 1 ] || twice=$((twice + 1))
done
cond "two concurrent runs, 200 times: exactly one succeeds each time" '[ $twice = 0 ] && [ "$(temps race)" = 0 ]'

# A big netlist for the full file system and the killed run.
python3 "$src/bench/gen_design.py" 60000 big.json --shared >/dev/null

# A full file system: the run fails and replaces none of the old files.
if unshare -rm true 2>/dev/null; then
    mkdir full
    unshare -rm bash -c '
        mount -t tmpfs -o size=2m tmpfs full || exit 9
        "$0" -pf -tf top.json full/top.v >/dev/null 2>&1 || exit 8
        cp full/top.v full/top.tv full/top.pin .
        "$0" -w -fn -pf -tf big.json full/top.v >/dev/null 2>err.txt; echo $? > rc.txt
        cmp -s top.v full/top.v && cmp -s top.tv full/top.tv && cmp -s top.pin full/top.pin || exit 7
        [ "$(find full -name "*.tmp*" | wc -l)" = 0 ] || exit 6' "$bin/qdb2ver"
    rc=$?
    cond "a full file system: exit 1, old outputs kept, no temporary left (code $rc)" \
        '[ $rc = 0 ] && [ "$(cat rc.txt)" = 1 ] && grep -q "No space left on device" err.txt'
else
    echo "skipped a full file system: no tmpfs can be mounted here"
fi

# Interrupted, terminated or hung up while the netlist is written: ended by
# the signal, no temporary left, old file kept. The run is stopped while its
# temporary exists, so that the signal meets it mid-write however fast it
# is (a run that ended first is tried again). A background job of a script
# starts with SIGINT ignored, which a run keeps; env gives the signals back
# their default.
mkdir killed
"$bin/qdb2ver" top.json killed/top.v >/dev/null 2>&1 && cp killed/top.v killed.keep
for sig in INT:130 TERM:143 HUP:129; do
    for _ in 1 2 3 4 5; do
        cp killed.keep killed/top.v
        env --default-signal "$bin/qdb2ver" -w -fn big.json killed/top.v >/dev/null 2>&1 & pid=$!
        for _ in $(seq 3000); do [ "$(temps killed)" != 0 ] && break; sleep 0.01; done
        kill -STOP $pid 2>/dev/null
        seen=$(temps killed)
        kill -${sig%:*} $pid 2>/dev/null; kill -CONT $pid 2>/dev/null; wait $pid; rc=$?
        [ "$seen" != 0 ] && break
    done
    cond "SIG${sig%:*} during a large write: exit $rc, no temporary, old file kept" \
        '[ "$seen" != 0 ] && [ $rc = ${sig#*:} ] && [ "$(temps killed)" = 0 ] && cmp -s killed/top.v killed.keep'
done

# Inputs that change while read or never end: an error, exit 2, no crash.
{ cat top.json; head -c 48000000 /dev/zero | tr '\0' ' '; } > long.json
crashes=0
for delay in 0 0.02 0.05 0.08 0.12 0.2 0.3; do
    cp long.json shrink.json
    "$bin/qdb2ver" -w shrink.json shrink.v >/dev/null 2>err.txt & pid=$!
    sleep $delay; truncate -s 100 shrink.json; wait $pid; rc=$?
    if [ $rc != 0 ] && { [ $rc != 2 ] || ! said "shrink.json"; }; then crashes=$((crashes + 1)); fi
done
cond "truncation during the read: exit 2 with a message, never a crash" '[ $crashes = 0 ]'
cond "/dev/zero as design: exit 2 within seconds" \
    '[ "$(code timeout 20 "$bin/qdb2ver" /dev/zero zero.v)" = 2 ] && said "not a regular file"'
for file in data/cells.dat data/device.key verilog/src/chipwide.v; do
    rm -rf inst && cp -r "$src/share" inst && ln -sf /dev/zero "inst/$file"
    rc=$(VORNIX=$work/inst code timeout 20 "$bin/qdb2ver" -w top.json zero.v)
    cond "/dev/zero as installation $file: an error within seconds (exit $rc)" \
        '[ $rc = 1 -o $rc = 2 ] && said "inst/$file" && said "not a regular file"'
done
finish
