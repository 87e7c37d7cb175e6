#!/usr/bin/env bash
# SPDX-License-Identifier: MIT
# The dynamic symbols that a library defines are exactly those of a list, and its SONAME has a major version:
# exported_symbols.sh LIBRARY LIST
set -euo pipefail
# The list has the symbols of x86-64. Where a long double has 128 bits, it stands in them as another letter.
diff "$2" <(nm -D --defined-only --format=posix "$1" | cut -d' ' -f1 |
    sed -E 's/^(_Z10toSIStringB5cxx11)(g|u9__ieee128)j$/\1ej/' | LC_ALL=C sort)
readelf -d "$1" | grep -qE 'SONAME.*\[libvardel_ip_quarzel\.so\.[0-9]+\]'
