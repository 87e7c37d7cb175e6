#!/usr/bin/env bash
# SPDX-License-Identifier: MIT
# The bindings build and pass their tests where the packages of the tool and of sweeps are not installed, which takes
# some minutes: without_tool.sh SOURCE BUILD [CMAKE_OPTION...]
set -euo pipefail
cd "$1"
build=$2
shift 2

# Packages that CMake looks for by name, and those that it looks for by a file.
missing=()
for package in CLI11 fmt xtensor OpenSSL nlohmann_json MPI; do
    missing+=("-DCMAKE_DISABLE_FIND_PACKAGE_$package=ON")
done
for file in QUARZEL_RANDOM123_INCLUDE QUARZEL_MPFR_INCLUDE QUARZEL_MPFR; do
    missing+=("-D$file=")
done
cmake --preset release -B "$build" -DQUARZEL_TOOL=OFF -DQUARZEL_BINDINGS=ON "${missing[@]}" "$@" >"$build.log"
grep -q "Sweeps left out: they need Random123 and MPFR" "$build.log"
cmake --build "$build" >>"$build.log" || {
    cat "$build.log" >&2
    exit 1
}
if find "$build" -name '_sweep.*.so' -o -name 'libquarzel_sweep.a' -o -name 'libquarzel_link.a' | grep .; then
    echo "these need packages that are not there" >&2
    exit 1
fi
for binding in "$build"/bindings/python/quarzel/_core.*.so "$build"/bindings/octave/quarzel/quarzel_mex.mex \
    "$build"/bindings/systemverilog/libquarzel_dpi.so; do
    if readelf -d "$binding" | grep -E 'NEEDED.*(fmt|mpfr|crypto)'; then
        echo "$binding needs a library of the tool" >&2
        exit 1
    fi
done
ctest --test-dir "$build" --output-on-failure --no-tests=error -R '^(HostCore|Guarded|BindingsEncoding|Python|Octave|SystemVerilog|DpiLibrary|Vhdl)\.'
