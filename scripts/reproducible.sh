#!/usr/bin/env bash
# SPDX-License-Identifier: MIT
# Two builds at different times, under different path, time zone, locale and umask, give the same bytes:
# reproducible.sh [TARGET...]. Without a target: both libraries and the tool.
set -euo pipefail
cd "$(dirname "$0")/.."
[ $# -gt 0 ] || set -- vardel_ip_quarzel vardel_ip_quarzel_static quarzel
work=$PWD/build/reproducible
rm -rf "$work"

# Build in a folder: build FOLDER TARGET...
build() {
    local folder=$work/$1
    shift
    mkdir -p "$folder/source"
    git ls-files -z | tar c --null --files-from=- | tar x -C "$folder/source"
    cmake -G Ninja -S "$folder/source" -B "$folder/build" -DCMAKE_BUILD_TYPE=Release -DQUARZEL_TESTS=OFF \
        -DCMAKE_C_COMPILER=clang -DCMAKE_CXX_COMPILER=clang++
    cmake --build "$folder/build" --target "$@"
}
(umask 022; export TZ=UTC LC_ALL=C; build one "$@")
(umask 077; export TZ=Pacific/Kiritimati LC_ALL=C.UTF-8; build another/longer/path "$@")

compared=0
while read -r file; do
    cmp "$work/one/build/$file" "$work/another/longer/path/build/$file"
    echo "the same: $file"
    compared=$((compared + 1))
done < <(cd "$work/one/build" && find src tools -type f \( -name 'lib*.so.*' -o -name 'lib*.a' -o -path '*/quarzel/quarzel' \))
[ $compared -ge $# ]
