#!/usr/bin/env bash
# SPDX-License-Identifier: MIT
# Install into a temporary prefix, move it, and use it as its users do: install_test.sh SOURCE BUILD
set -euo pipefail
source=$1
build=$2
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT

cmake --install "$build" --prefix "$work/first" >"$work/log"
mv "$work/first" "$work/moved"
prefix=$work/moved
libdir=$(dirname "$(find "$prefix" -name vardel_ip_quarzel.pc)")/..
expected="status 0, 40 bits, first bit 0, tag 1"

expect() { # NAME COMMAND...
    local name=$1 got
    shift
    got=$("$@")
    if [ "$got" != "$expected" ]; then
        echo "$name printed \"$got\" instead of \"$expected\"" >&2
        exit 1
    fi
    echo "ok: $name"
}

# The example in the README is the one that is built here.
diff <(awk '/^```c$/ { code = 1; next } /^```$/ { code = 0 } code' "$source/README.md") \
    "$source/examples/decode_block.c"
echo "ok: the README shows the example"

# The tool is there with its manual page and its completion scripts, which it has written itself.
"$prefix/bin/quarzel" manual | cmp - "$prefix/share/man/man1/quarzel.1"
"$prefix/bin/quarzel" completion bash | cmp - "$prefix/share/bash-completion/completions/quarzel"
"$prefix/bin/quarzel" completion zsh | cmp - "$prefix/share/zsh/site-functions/_quarzel"
"$prefix/bin/quarzel" completion fish | cmp - "$prefix/share/fish/vendor_completions.d/quarzel.fish"
echo "ok: manual page and completion"

cmake -S "$source/tests/install/consumer" -B "$work/cmake" -DCMAKE_PREFIX_PATH="$prefix" >>"$work/log"
cmake --build "$work/cmake" >>"$work/log"
expect "CMake, shared library" "$work/cmake/decode_block"
expect "CMake, classes in the archive" "$work/cmake/decode_with_classes"
expect "CMake, ports from C99" "$work/cmake/use_ports"
expect "CMake, the class from C++20" "$work/cmake/use_core"

# As a part of another project it has the same targets, and installs nothing.
cmake -S "$source/tests/install/subproject" -B "$work/parent" -DQUARZEL_SOURCE="$source" >>"$work/log"
cmake --install "$work/parent" --prefix "$work/nothing" >>"$work/log"
if [ -n "$(find "$work/nothing" -type f 2>/dev/null)" ]; then
    echo "a subproject installed files" >&2
    exit 1
fi
echo "ok: a subproject has the targets and installs nothing"

export PKG_CONFIG_PATH=$libdir/pkgconfig
cc -std=c99 "$source/examples/decode_block.c" -o "$work/by_pkg_config" \
    $(pkg-config --cflags --libs vardel_ip_quarzel) -Wl,-rpath,"$(pkg-config --variable=libdir vardel_ip_quarzel)"
expect "pkg-config" "$work/by_pkg_config"
case $(pkg-config --cflags --libs vardel_ip_quarzel) in
*"$work/first"*)
    echo "the .pc file remembers where it was installed" >&2
    exit 1
    ;;
esac

gcc -std=c99 "$source/examples/decode_block.c" -o "$work/plain" -I"$prefix/include" -L"$libdir" -lvardel_ip_quarzel
expect "plain gcc" env LD_LIBRARY_PATH="$libdir" "$work/plain"

gcc -std=c99 "$source/examples/decode_block.c" -o "$work/static" -I"$prefix/include" \
    "$libdir/libvardel_ip_quarzel.a" -lstdc++ -lm
expect "plain gcc, archive" "$work/static"

# Every installed header of the classes compiles alone.
while read -r header; do
    echo "#include <$header>" | g++ -std=c++20 -x c++ -fsyntax-only -I"$prefix/include" -I"$prefix/include/quarzel" -
done < <(cd "$prefix/include/quarzel" && find . -name '*.hpp')
echo "ok: every header compiles alone"
