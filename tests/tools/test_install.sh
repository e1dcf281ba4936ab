#!/usr/bin/env bash
# Installs the build into a temporary prefix, moves the prefix elsewhere and
# checks that the moved programs still find their installation, and that a
# project outside the tree builds against the installed CMake package.
set -uo pipefail
src=${NLW_SRC:-$(cd "$(dirname "$0")/../.." && pwd)}
bin=${NLW_BIN:-$src/build}
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
fail=0
ok() { echo "ok   $1"; }
bad() { echo "FAIL $1"; fail=1; }
unset VORNIX

cmake --install "$bin" --prefix "$work/first" >"$work/install.log" 2>&1 || { cat "$work/install.log"; exit 1; }
mv "$work/first" "$work/moved"
prefix=$work/moved
for f in bin/qdb2ver bin/tessel bin/rtl2json lib/libnlw_verilog.a lib/libnlw_reader.a \
         include/nlw_verilog/Nlw_Verilog.h include/nlw_verilog/model/Nlw_Nl.h \
         share/nlw_verilog/verilog/src/chipwide.v lib/cmake/nlw_verilog/nlw_verilogConfig.cmake; do
    [ -e "$prefix/$f" ] && ok "installed $f" || bad "missing $f"
done

design=$src/examples/counter/counter.json
if "$prefix/bin/qdb2ver" -ism "$design" "$work/counter.v" >"$work/run.log" 2>&1 &&
   grep -q "^module V_FD" "$work/counter.v" && grep -qF "$prefix/share/nlw_verilog" "$work/counter.v"; then
    ok "moved qdb2ver -ism includes the models of its own installation"
else
    bad "moved qdb2ver -ism"; cat "$work/run.log"; grep -n "V_FD\|share" "$work/counter.v" | head
fi
version=$("$prefix/bin/tessel" --version)
case $version in "tessel (nlw-verilog) "[0-9]*) ok "tessel --version: $version" ;; *) bad "tessel --version: '$version'" ;; esac

# A consumer project; a sanitized build needs the sanitizers at link time.
flags=""
[ "${NLW_SANITIZE:-OFF}" = ON ] && flags="-fsanitize=address,undefined"
if cmake -S "$src/tests/tools/install" -B "$work/consumer" -DCMAKE_PREFIX_PATH="$prefix" \
         -DCMAKE_BUILD_TYPE=Release "-DCMAKE_CXX_FLAGS=$flags" >"$work/consumer.log" 2>&1 &&
   cmake --build "$work/consumer" >>"$work/consumer.log" 2>&1; then
    ok "consumer project builds against the installed package"
    if "$work/consumer/consumer" "$design" "$work/consumer.v" >>"$work/consumer.log" 2>&1 &&
       grep -q "^module counter" "$work/consumer.v"; then
        ok "consumer writes a netlist through Nlw_Verilog"
    else
        bad "consumer run"; tail -20 "$work/consumer.log"
    fi
else
    bad "consumer project build"; tail -30 "$work/consumer.log"
fi
exit $fail
