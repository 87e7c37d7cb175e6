#!/usr/bin/env bash
# SPDX-License-Identifier: MIT
# What the trace writer in VHDL writes is what quarzel trace-diff reads: trace_writer_test.sh SOURCE TOOL
set -euo pipefail
source=$1
tool=$2
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
cd "$work"

"$tool" decode "$source/examples/captures/k40.soft.npy" --units 2 --iterations 2 --trace 4 --trace-format csv \
    >model.csv 2>decode.log
awk -F, '$4 == "llr" { print $2, $3, $6 }' model.csv >values.txt
ghdl -a --std=08 "$source/examples/vhdl/trace_writer.vhd" "$source/tests/bindings/systemverilog/trace_writer_test.vhd"
ghdl -e --std=08 trace_writer_test

ghdl -r --std=08 trace_writer_test
"$tool" trace-diff model.csv simulation.csv >compared
grep -qx "compared      1 block, 4 passes: llr" compared
grep -qx "result        the traces are equal" compared
echo "ok: the values that were written are those of the model"

ghdl -r --std=08 trace_writer_test -gunknown_step=17
status=0
"$tool" trace-diff model.csv simulation.csv >compared || status=$?
[ "$status" -eq 1 ]
grep -qx "step          17 of 0 to 42" compared
grep -qE "^value in B    x, line 19$" compared
grep -qx "differ        4 of 172 values" compared
echo "ok: an unknown value is found"
