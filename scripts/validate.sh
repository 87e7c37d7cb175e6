#!/usr/bin/env bash
# SPDX-License-Identifier: MIT
# Simulate what docs/validation.md holds against others' figures, draw it and write its tables, with build/release.
# The decoders that are not the core take a quarter of an hour. Results that are there are extended: nothing to do.
set -euo pipefail
cd "$(dirname "$0")/.."
quarzel=build/release/tools/quarzel/quarzel
folder=docs/validation
others=$folder/other_decoders.csv

# Rows of decoders that are not the core, on the core's link.
other_decoders() {
    local at_6144=(--block-size 6144 --iterations 6 --ebn0 0.3,0.4,0.5,0.6,0.7 --max-block-errors 200 --max-blocks 8000)
    local at_240=(--block-size 240 --iterations 8 --ebn0 0.161,0.761,1.361 --max-block-errors 300)
    local at_1024=(--block-size 1024 --iterations 6)
    local fading=("${at_1024[@]}" --rayleigh --ebn0 1.7,1.8,1.9,2.0,2.1,2.2 --max-block-errors 300 --max-blocks 40000)
    local awgn=("${at_1024[@]}" --ebn0 0.3,0.4,0.5,0.6,0.7,0.8,0.9,1.0 --max-block-errors 200)
    run "max-log, float, extrinsics x 0.75" --decoder float --scale 0.75 "${at_6144[@]}"
    run "max-log, float, extrinsics x 0.5, 0.6, 0.65, 0.7, 0.8, 0.9" --decoder float \
        --scale 0.5,0.6,0.65,0.7,0.8,0.9 "${at_6144[@]}"
    run "max-log, float, extrinsics x 1" --decoder float "${at_6144[@]}"
    run "max-log, float, extrinsics x 0.75, 8 segments" --decoder float --scale 0.75 --segments 8 "${at_6144[@]}"
    run "max-log, float, extrinsics x 0.75, 96 segments" --decoder float --scale 0.75 --segments 96 "${at_6144[@]}"
    run "type 1, 2 units" --decoder core --algorithm 1 "${at_6144[@]}"
    run "type 1, one segment" --decoder one-segment --algorithm 1 "${at_6144[@]}"
    run "type 2, 2 units" --decoder core --algorithm 2 "${at_240[@]}"
    run "type 2, one segment" --decoder one-segment --algorithm 2 "${at_240[@]}"
    run "log-MAP, float" --decoder float-log-map "${at_240[@]}"
    run "max-log, float, extrinsics x 0.75" --decoder float --scale 0.75 "${awgn[@]}"
    run "type 1, 2 units" --decoder core --algorithm 1 "${awgn[@]}"
    run "type 1, one segment" --decoder one-segment --algorithm 1 "${awgn[@]}"
    run "max-log, float, extrinsics x 0.75" --decoder float --scale 0.75 "${fading[@]}"
}
run() { build/release/bench/quarzel_other_decoders --label "$@"; }

other_decoders | awk 'NR == 1 || !/^source/' >"$others"
"$quarzel" sweep --block-size 6144 --algorithm 0,1,2 --iterations 6 --ebn0 0.2:0.05:1 --max-blocks 1e6 \
    --max-block-errors 300 --target-bler 1e-3 -o $folder/k6144.json
"$quarzel" sweep --block-size 240 --algorithm 2 --iterations 8 --ebn0 0.161,0.461,0.761,1.061,1.361 --max-blocks 1e6 \
    --max-block-errors 500 -o $folder/k240.json
"$quarzel" sweep --channel rayleigh --block-size 1024 --algorithm 1 --iterations 6 --ebn0 1.7:0.1:2.3 \
    --max-blocks 60000 --max-block-errors 500 -o $folder/rayleigh.json
"$quarzel" plot $folder/k6144.json --panel bler --reference $folder/published.csv --block-size 6144 -o $folder/k6144.svg
"$quarzel" plot $folder/k240.json --panel bler --reference $folder/published.csv --block-size 240 -o $folder/k240.svg
"$quarzel" plot $folder/rayleigh.json --panel bler --reference $folder/published.csv --block-size 1024 -o $folder/rayleigh.svg
/usr/bin/python3 scripts/validation_tables.py "$quarzel" docs/validation.md
