#!/usr/bin/env bash
# SPDX-License-Identifier: MIT
# Binaries have read-only relocations, bound at the start, and a checked stack that cannot be executed. The first one, the
# library, needs no C library above 2.29 and no C++ library above that of GCC 11: hardened.sh LIBRARY [BINARY...]
set -euo pipefail
newest() {
    readelf --version-info --wide "$1" | grep -oE "Name: $2_[0-9.]+" | sed "s/.*_//" | sort -V | tail -1
}
for binary in "$@"; do
    segments=$(readelf --program-headers --wide "$binary")
    grep -q 'GNU_RELRO' <<<"$segments" || { echo "$binary: relocations stay writable"; exit 1; }
    grep -qE 'GNU_STACK.* RW ' <<<"$segments" || { echo "$binary: the stack can be executed"; exit 1; }
    grep -qE 'BIND_NOW|Flags:.* NOW' <<<"$(readelf --dynamic --wide "$binary")" ||
        { echo "$binary: symbols are not bound at the start"; exit 1; }
    grep -q '__stack_chk_fail' <<<"$(readelf --dyn-syms --wide "$binary")" ||
        { echo "$binary: no stack is checked"; exit 1; }
    echo "$binary needs GLIBC_$(newest "$binary" GLIBC) and GLIBCXX_$(newest "$binary" GLIBCXX)"
done
library=$1
[ "$(printf '%s\n' 2.29 "$(newest "$library" GLIBC)" | sort -V | tail -1)" = 2.29 ]
[ "$(printf '%s\n' 3.4.29 "$(newest "$library" GLIBCXX)" | sort -V | tail -1)" = 3.4.29 ]
