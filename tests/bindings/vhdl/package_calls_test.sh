#!/usr/bin/env bash
# SPDX-License-Identifier: MIT
# Install the library and the package, and call them from GHDL: package_calls_test.sh SOURCE BUILD GHDL
set -euo pipefail
source=$1
build=$2
ghdl=$3
here=$source/tests/bindings/vhdl
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
cd "$work"

for binding in systemverilog vhdl; do
    cmake --install "$build/bindings/$binding" --prefix "$work/prefix" >>log
done
LD_LIBRARY_PATH=$(dirname "$(find "$work/prefix" -name libquarzel_dpi.so)")
export LD_LIBRARY_PATH
package=$work/prefix/share/quarzel/vhdl/quarzel_pkg.vhd

# The page's first block is run, and prints what the page says.
project=$source
. "$source/tests/support/page_blocks.sh"
blocks docs/vhdl.md vhdl "The first block" >first.vhd
blocks docs/vhdl.md text "The first block" >expected
for standard in 93 08; do
    mkdir "std$standard"
    "$ghdl" -a --std=$standard --workdir="std$standard" "$package" first.vhd
    "$ghdl" -r --std=$standard --workdir="std$standard" first | diff expected -
done
echo "ok: vhdl.md"

"$ghdl" -a --std=08 "$package" "$here/package_calls_test.vhd"
"$ghdl" -r --std=08 package_calls_test | diff "$here/package_calls_test.txt" -
grep -q "^decode=0 siso=1$" trace.txt
echo "ok: calls, refusals, warnings and traces"
if "$ghdl" -r --std=08 package_calls_test -gunknown=true >unknown 2>&1; then
    echo "an unknown soft value did not stop the simulation" >&2
    exit 1
fi
grep -q "(assertion failure): a soft value has bits that are neither 0 nor 1$" unknown
echo "ok: an unknown soft value stops the simulation"
