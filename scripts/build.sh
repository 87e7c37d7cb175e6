#!/usr/bin/env bash
# SPDX-License-Identifier: MIT
# Configure and build one preset: build.sh PRESET. Shows the build's steps on a terminal and its whole output when
# it fails.
set -euo pipefail
cd "$(dirname "$0")/.."
preset=$1
log=build/$preset.log
mkdir -p build
echo "Building \"$preset\" (some minutes the first time, log in $log)"
if ! cmake --preset "$preset" >"$log" 2>&1; then
    cat "$log" >&2
    exit 1
fi
if [ -t 1 ]; then
    cmake --build --preset "$preset"
elif ! cmake --build --preset "$preset" >>"$log" 2>&1; then
    cat "$log" >&2
    exit 1
fi
