#!/usr/bin/env bash
# SPDX-License-Identifier: MIT
# Install the library and the package, and use them as a new user would: package_test.sh OCTAVE PACKAGE SOURCE BUILD
set -euo pipefail
octave=$1
package=$2
source=$3
build=$4
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT

cmake --install "$build" --prefix "$work/prefix" >"$work/log"
PKG_CONFIG_PATH=$(dirname "$(find "$work/prefix" -name vardel_ip_quarzel.pc)")
export PKG_CONFIG_PATH HOME=$work
mkdir "$work/empty"
cd "$work/empty"
run() { "$octave" --no-history --quiet --no-init-file --eval "$1"; }

run "pkg prefix $work/packages $work/packages; pkg install $package" >>"$work/log" 2>&1 || {
    cat "$work/log" >&2
    exit 1
}
echo "ok: pkg install"

# The page's first block is run, and prints what the page says.
awk '/^```octave$/ { code = 1; next } /^```$/ { code = 0 } code' "$source/docs/octave.md" >first_block.m
awk '/^```text$/ { text = 1; next } /^```$/ { text = 0 } text' "$source/docs/octave.md" >expected
run "pkg load quarzel; first_block" >printed
diff expected printed
echo "ok: octave.md"

run "pkg load quarzel; help quarzel_decode" | grep -q "POSITIVE MEANS BIT 1"
run "pkg load quarzel; help quarzel_encode" | grep -q "Encode LTE code blocks"
echo "ok: help"
