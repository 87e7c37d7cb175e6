#!/usr/bin/env bash
# SPDX-License-Identifier: MIT
# The dynamic symbols that a library defines are exactly those of a list, and its SONAME has a major version:
# exported_symbols.sh LIBRARY LIST
set -euo pipefail
diff "$2" <(nm -D --defined-only --format=posix "$1" | cut -d' ' -f1 | LC_ALL=C sort)
readelf -d "$1" | grep -qE 'SONAME.*\[libvardel_ip_quarzel\.so\.[0-9]+\]'
