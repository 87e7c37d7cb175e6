#!/bin/sh
# SPDX-License-Identifier: MIT
# Makes docs/quantiser/rate_1e-2.csv and rate_1e-4.csv with the tool given: measure.sh build/release/tools/quarzel/quarzel
# All factors get the same bits and the same noise.
set -eu
tool=$1
folder=$(dirname "$0")

# The lines of a block size and an algorithm type: measure K TYPE EBN0 MAX_BLOCKS
measure() {
    "$tool" sweep --block-size "$1" --algorithm "$2" --iterations 8 --ebn0 "$3" --max-blocks "$4" \
        --llr 1,2,3,4,5,6,8,12,16 --csv
}

# The first of several tables has the head of all.
joined() {
    awk 'NR == 1 || !/^block_size/'
}

{
    measure 40 0 2.3 50000
    measure 40 1 2.3 50000
    measure 40 2 2.3 50000
    measure 1024 0 1.1 50000
    measure 1024 1 0.9 50000
    measure 1024 2 0.8 50000
    measure 6144 0 0.8 8000
    measure 6144 1 0.6 8000
    measure 6144 2 0.5 8000
} | joined >"$folder/rate_1e-2.csv"
{
    measure 40 0 4 500000
    measure 40 1 4 500000
    measure 40 2 4 500000
    measure 1024 0 1.5 200000
    measure 1024 1 1.2 200000
    measure 1024 2 1.15 200000
    measure 6144 0 0.95 150000
    measure 6144 1 0.75 150000
    measure 6144 2 0.65 150000
} | joined >"$folder/rate_1e-4.csv"
