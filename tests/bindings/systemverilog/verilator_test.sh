#!/usr/bin/env bash
# SPDX-License-Identifier: MIT
# Install the binding, build the examples and the test benches against it, and run them: verilator_test.sh SOURCE BUILD
set -euo pipefail
source=$1
build=$2
here=$source/tests/bindings/systemverilog
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT

cmake --install "$build/bindings/systemverilog" --prefix "$work/prefix" >"$work/log"
library=$(find "$work/prefix" -name libquarzel_dpi.so)
packages=$work/prefix/share/quarzel/systemverilog
mkdir "$work/empty"
cd "$work/empty"

# The simulator's own runtime is compiled once for both, without optimisation, which costs more than it gains here.
simulator() { # NAME TOP SOURCE... OPTION...
    local name=$1 top=$2
    shift 2
    verilator --binary --timing -j 2 --output-split 0 \
        -MAKEFLAGS "OPT_FAST=-O0 OPT_GLOBAL=-O0 VM_PARALLEL_BUILDS=0" --top-module "$top" --prefix "V$name" -o "$name" \
        "$packages/quarzel_pkg.sv" "$@" "$library" >"$name.log" 2>&1 || {
        cat "$name.log" >&2
        exit 1
    }
}

simulator bench bench -Wall -Wno-DECLFILENAME "$source/examples/systemverilog/stand_in.sv" "$source/examples/systemverilog/bench.sv"
data=+directory=$source/examples/systemverilog
obj_dir/bench "$data" >passed
grep -qx "20 blocks of 40 bits are those of the model" passed
echo "ok: the device that is right passes"
if obj_dir/bench "$data" +error_block=7 +error_bit=12 >failed 2>&1; then
    echo "the device that is wrong passed" >&2
    exit 1
fi
grep -qE "block 7: bit 12 is [01], the model gives [01]$" failed
echo "ok: the device that is wrong fails by block and bit"

# The page's first block is run, and prints what the page says.
awk '/^```systemverilog$/ { code = 1; next } /^```$/ { code = 0 } code' "$source/docs/systemverilog.md" >first.sv
awk '/^```text$/ { text = 1; next } /^```$/ { text = 0 } text' "$source/docs/systemverilog.md" >expected
simulator first first first.sv
obj_dir/first | sed '/Verilog \$finish$/d' | diff expected -
echo "ok: systemverilog.md"

simulator calls dpi_calls_test "$here/dpi_calls_test.sv"
obj_dir/calls >printed
sed -e 's/^\[0\] %Warning: .*: quarzel: /warning: /' -e '/Verilog \$finish$/d' printed | diff "$here/dpi_calls_test.txt" -
grep -q "^decode=1 siso=1$" trace.txt
echo "ok: calls, refusals, warnings and traces"
# A wrong call of the class, and what it prints: stops ARGUMENT TEXT
stops() {
    if obj_dir/calls "$1" >refused 2>&1; then
        echo "a wrong call did not stop the simulation" >&2
        exit 1
    fi
    grep -q "quarzel: $2$" refused
}
stops +refused "the streams have 44, 44 and 0 values; they must have the same number"
stops +too_long "there is no block size for streams of 6149 soft values; the nearest that have one: 6148 (K = 6144)"
echo "ok: a wrong call of the class stops the simulation"

# Verilator 5.006 converts no argument to its base class: the parts for UVM call nobody their parent.
sed -E 's/("outputs", |get\()this/\1nobody/' "$packages/quarzel_uvm_pkg.sv" >quarzel_uvm_pkg.sv
simulator uvm uvm_parts_test "+incdir+$here/uvm" "$here/uvm/uvm_pkg.sv" quarzel_uvm_pkg.sv \
    "$here/uvm/uvm_parts_test.sv"
obj_dir/uvm | sed '/Verilog \$finish$/d' | diff "$here/uvm/uvm_parts_test.txt" -
grep -q "^decode=1 siso=1$" traced_by_model.txt
echo "ok: the parts for UVM with stand-ins for its classes"
obj_dir/uvm +early | grep -qx "UVM_ERROR \[ORDER\] block 0 came out, but none has gone in for it"
if obj_dir/uvm +refused >refused 2>&1; then
    echo "a refused block did not stop the simulation" >&2
    exit 1
fi
grep -q "UVM_FATAL \[MODEL\] the streams of block 0 have different sizes$" refused
echo "ok: what the parts for UVM refuse"
