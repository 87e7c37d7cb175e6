#!/usr/bin/env bash
# SPDX-License-Identifier: MIT
# GTKWave's converters read the waves of a trace, and give them back as they were: waves_test.sh SOURCE TOOL
set -euo pipefail
source=$1
tool=$2
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
cd "$work"

for form in text vcd; do
    "$tool" decode "$source/examples/captures/k40.soft.npy" --units 2 --iterations 2 --trace 6 --trace-format $form \
        >model.$form 2>decode.log
done
vcd2fst model.vcd model.fst
fst2vcd -f model.fst -o back.vcd
vcd2lxt2 model.vcd model.lxt >converted.log 2>&1
lxt2vcd model.lxt >back_lxt.vcd 2>>converted.log
for waves in model.vcd back.vcd back_lxt.vcd; do
    "$tool" trace-diff model.text $waves >compared
    grep -qx "compared      2 blocks, 6 passes: soft inputs, int, g, a, b, llr, ext" compared
    echo "ok: $waves holds the values of the trace"
done
[ "$(grep -c '^\$var integer 12 ' back.vcd)" -eq 26 ]
