#!/usr/bin/env bash
# SPDX-License-Identifier: MIT
# Compute the tables of docs/atlas.md and draw their pictures, with build/release: the same bytes on any machine. Points
# that are simulated stay in build/atlas, from which an interrupted run goes on.
set -euo pipefail
cd "$(dirname "$0")/.."
work=build/atlas
mkdir -p $work

# The thresholds of all types and iterations that are looked at: thresholds NAME OPTION...
thresholds() {
    local name=$1
    shift
    build/release/tools/quarzel/quarzel threshold "$@" --algorithm 0,1,2 --iterations 4,6,8 --target-bler 0.1,0.01 \
        -o "$work/$name.json" --csv >"$work/$name.csv"
}

thresholds thresholds --block-size all
thresholds units --block-size 768,1024,1280,1536,2048,2560,3072,4096,5120,6144 --units 2,4,8 --precision 0.014
mv $work/thresholds.csv $work/units.csv docs/atlas/
gnuplot docs/atlas/pictures.gp
