#!/usr/bin/env bash
# SPDX-License-Identifier: MIT
# The library gives what the package imports and nothing else, and needs no C++ runtime: library_test.sh LIBRARY PACKAGE
set -euo pipefail
library=$1
package=$2
imported=$(sed -nE 's/^ *import "DPI-C" function .*\b(quarzel_dpi_[a-z_]+)\(.*/\1/p' "$package" | sort)
[ "$(wc -l <<<"$imported")" -ge 15 ]
diff <(echo "$imported") <(nm -D --defined-only "$library" | awk '{ print $3 }' | sort)
echo "ok: exported is what the package imports"
if readelf -dW "$library" | grep -E 'NEEDED.*(stdc\+\+|libgcc_s)' || nm -D "$library" | grep ' U _Z'; then
    echo "the library needs a C++ runtime" >&2
    exit 1
fi
echo "ok: no C++ runtime is needed"
if nm -D --undefined-only "$library" | grep -E ' [^wv] sv'; then
    echo "a loader that binds eagerly would refuse the library" >&2
    exit 1
fi
echo "ok: functions of the simulator may be missing"
