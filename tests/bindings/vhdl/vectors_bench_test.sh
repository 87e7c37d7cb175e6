#!/usr/bin/env bash
# SPDX-License-Identifier: MIT
# Make test vectors, run the VHDL bench on them in GHDL, and compare: vectors_bench_test.sh SOURCE TOOL GHDL
set -euo pipefail
source=$1
tool=$2
ghdl=$3
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
cd "$work"

"$tool" vectors vectors --block-size 40,512 --units 8 --blocks 4 --ebn0 0.8 --seed 3 >log 2>&1
"$ghdl" -a --std=08 "$source"/examples/vhdl/{hex_files,replay,vectors_bench}.vhd 2>warnings
diff /dev/null warnings

"$ghdl" -r --std=08 vectors_bench >passed
grep -qx "8 blocks are those of the model" passed
"$tool" compare vectors/u8_a1 simulated.hex >/dev/null
echo "ok: the device that is right passes"

if "$ghdl" -r --std=08 vectors_bench -gerror_block=1 -gerror_bit=17 >failed 2>&1; then
    echo "the device that is wrong passed" >&2
    exit 1
fi
grep -qE "^block 1: bit 17 is [01], the model gives [01]$" failed
grep -qE "\(assertion failure\): 1 of 2208 bits differ$" failed
if "$tool" compare vectors/u8_a1 simulated.hex >compared; then
    echo "compare found no difference" >&2
    exit 1
fi
grep -qE "^block +1 of 0 to 7 " compared
grep -qE "^bit +17 of 0 to 39$" compared
echo "ok: the device that is wrong fails by block and bit, in the bench and in quarzel compare"

# A file that ends early is no pass.
sed -i '$d' vectors/u8_a1/rsc2_par.hex
if "$ghdl" -r --std=08 vectors_bench >short 2>&1; then
    echo "a file that is too short passed" >&2
    exit 1
fi
grep -q "(assertion failure): the file has too few words$" short
echo "ok: a file that ends early is an error"
