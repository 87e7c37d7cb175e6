#!/usr/bin/env bash
# SPDX-License-Identifier: MIT
# Decode the captures that come with the project and compare with the decisions of the core and with the bits
# that were sent: demo.sh QUARZEL CAPTURES. Fails when a decision differs from the core's.
set -euo pipefail
quarzel=$1
captures=$2
options=(--units 8 --algorithm 1 --iterations 6)

echo "Decoding noisy LTE code blocks with 8 units, max-log with scaled extrinsics, 6 iterations"
rows=()
status=0
for name in k40 k6144; do
    core=$("$quarzel" decode "$captures/$name.soft.npy" "${options[@]}" --json \
        --reference "$captures/$name.decided.npy")
    sent=$("$quarzel" decode "$captures/$name.soft.npy" "${options[@]}" --json \
        --reference "$captures/$name.sent.npy")
    rows+=("$(jq -nr --argjson core "$core" --argjson sent "$sent" --arg name "$name.soft.npy" \
        '[$name, $core.block_size, $core.blocks, $core.bits, ($core.mbit_per_s * 100 | round / 100),
          $core.bit_errors, $sent.bit_errors, $sent.block_errors] | @tsv')")
    [ "$(jq .bit_errors <<<"$core")" = 0 ] || status=1
done
printf '%s\n' "${rows[@]}" | column -t -s $'\t' \
    -N "capture,K,blocks,bits,Mbit/s,differ from core,bit errors,block errors" \
    -R "K,blocks,bits,Mbit/s,differ from core,bit errors,block errors" -o '  '
if [ $status -ne 0 ]; then
    echo "The decisions differ from those of the core." >&2
    exit 1
fi
echo "Every decision is the core's. The errors left are those of the noise."
