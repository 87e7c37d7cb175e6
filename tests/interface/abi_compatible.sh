#!/usr/bin/env bash
# SPDX-License-Identifier: MIT
# What a program compiled against an earlier version relies on is still there: every function with its types, and every
# record with its size and offsets. New functions are welcome: abi_compatible.sh STORED LIBRARY
#
# The description of a version, stored when it is released, is that of its library with debug information:
#   abidw --exported-interfaces-only --drop-private-types --headers-dir include --no-show-locs --short-locs \
#       --no-parameter-names --no-comp-dir-path --no-corpus-path --no-elf-needed LIBRARY
set -euo pipefail
if [[ $(readelf --section-headers "$2") != *.debug_info* ]]; then
    echo "$2 has no debug information, so that there are only symbols to compare" >&2
    exit 1
fi
abidiff --no-added-syms --ignore-soname "$1" "$2"
