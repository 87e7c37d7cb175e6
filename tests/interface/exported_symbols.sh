#!/usr/bin/env bash
# SPDX-License-Identifier: MIT
# The dynamic symbols that a library defines are exactly those of a list, and its SONAME has a major version:
# exported_symbols.sh LIBRARY LIST
set -euo pipefail
# The list has the symbols of x86-64. A long double of 128 bits and 64 bits that are no long are other letters in them.
diff "$2" <(nm -D --defined-only --format=posix "$1" | cut -d' ' -f1 |
    sed -E 's/^(_Z10toSIStringB5cxx11)(g|u9__ieee128)j$/\1ej/; s/^(_Z10toSIStringB5cxx11)yj$/\1mj/' | LC_ALL=C sort)
readelf -d "$1" | grep -qE 'SONAME.*\[libvardel_ip_quarzel\.so\.[0-9]+\]'
