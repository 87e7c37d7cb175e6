#!/usr/bin/env bash
# SPDX-License-Identifier: MIT
# The batch decode of the bindings beside the C array call, in turns: bindings.sh [PYTHON]. Needs build/release.
set -euo pipefail
cd "$(dirname "$0")/.."
build=build/release
for _ in 1 2 3; do
    PYTHONPATH=$build/bindings/python "${1:-/usr/bin/python3}" bench/python_decode.py $build/src/libvardel_ip_quarzel.so
    octave-cli --no-history --quiet --no-init-file --path $build/bindings/octave/quarzel bench/octave_decode.m
done
