#!/usr/bin/env bash
# Installs the build into a temporary prefix, moves the prefix elsewhere and
# checks that the moved programs still find their installation, and that a
# project outside the tree (tests/data/install) builds against the installed
# CMake package.
source "$(dirname "$0")/lib.sh"
cmake --install "$bin" --prefix first > install.log 2>&1 || { cat install.log; exit 1; }
mv first moved
prefix=$work/moved
for f in bin/qdb2ver bin/tessel bin/rtl2json lib/libnlw_verilog.a lib/libnlw_reader.a \
    include/nlw_verilog/Nlw_Verilog.h include/nlw_verilog/model/Nlw_Nl.h \
    share/nlw_verilog/verilog/src/chipwide.v lib/cmake/nlw_verilog/nlw_verilogConfig.cmake; do
    check "installed $f" test -e "$prefix/$f"
done
design=$src/examples/counter/counter.json
check "moved qdb2ver -ism includes the models of its own installation" eval "'$prefix/bin/qdb2ver' -ism \
    '$design' counter.v && grep -q '^module V_FD' counter.v && grep -qF '$prefix/share/nlw_verilog' counter.v"
check "tessel --version" eval "'$prefix/bin/tessel' --version | grep '^tessel (nlw-verilog) [0-9]'"
# A consumer project; a sanitized build needs the sanitizers at link time.
flags=""
[ "${NLW_SANITIZE:-OFF}" = ON ] && flags="-fsanitize=address,undefined"
check "consumer project builds against the installed package" eval "cmake -S '$data/install' -B consumer \
    -DCMAKE_PREFIX_PATH='$prefix' -DCMAKE_BUILD_TYPE=Release '-DCMAKE_CXX_FLAGS=$flags' && cmake --build consumer"
check "consumer writes a netlist through Nlw_Verilog" eval "consumer/consumer '$design' consumer.v &&
    grep -q '^module counter' consumer.v"
finish
