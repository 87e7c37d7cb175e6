#!/usr/bin/env bash
# SPDX-License-Identifier: MIT
# Make test vectors, run the bench without DPI on them in Icarus Verilog, and compare: icarus_test.sh SOURCE TOOL
set -euo pipefail
source=$1
tool=$2
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
cd "$work"

"$tool" vectors vectors --block-size 40,512 --units 8 --blocks 4 --ebn0 0.8 --seed 3 >log 2>&1
iverilog -g2012 -Wall -I vectors/u8_a1 -DVECTORS='"vectors/u8_a1"' -o bench \
    "$source/examples/systemverilog/vectors_bench.sv" 2>warnings
# The bench has no delays but those of its clock, and so no time scale.
if grep -v timescale warnings; then
    exit 1
fi

vvp -n bench >passed
grep -qx "8 blocks are those of the model" passed
"$tool" compare vectors/u8_a1 simulated.hex >/dev/null
echo "ok: the device that is right passes"

if vvp -n bench +error_block=1 +error_bit=17 >failed; then
    echo "the device that is wrong passed" >&2
    exit 1
fi
grep -qE "^block 1: bit 17 is [01], the model gives [01]$" failed
grep -qE "^FATAL: .*: 1 of 2208 bits differ$" failed
if "$tool" compare vectors/u8_a1 simulated.hex >compared; then
    echo "compare found no difference" >&2
    exit 1
fi
grep -qE "^block +1 of 0 to 7 " compared
grep -qE "^bit +17 of 0 to 39$" compared
echo "ok: the device that is wrong fails by block and bit, in the bench and in quarzel compare"
