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

# The examples in the README are those that are built here.
shown() { # LANGUAGE
    awk -v language="$1" '$0 == "```" language { code = 1; next } /^```$/ { code = 0 } code' "$source/README.md"
}
diff <(shown c) "$source/examples/decode_block.c"
diff <(shown cpp) "$source/examples/decode_array.cpp"
echo "ok: the README shows the examples"

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
"$work/cmake/decode_array" | grep -qE '^4000 bits decoded by [a-z0-9.]+, first bit 0$'
echo "ok: CMake, the class from C++20"

# As a part of another project it has the same targets, and installs nothing.
for fetch in OFF ON; do
    cmake -S "$source/tests/install/subproject" -B "$work/parent" -DQUARZEL_SOURCE="$source" -DFETCH=$fetch >>"$work/log"
    cmake --install "$work/parent" --prefix "$work/nothing" >>"$work/log"
    if [ -n "$(find "$work/nothing" -type f 2>/dev/null)" ]; then
        echo "a subproject installed files" >&2
        exit 1
    fi
    rm -r "$work/parent"
done
echo "ok: a subproject, added or fetched, has the targets and installs nothing"

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
    "$libdir/libvardel_ip_quarzel.a" $(pkg-config --static --libs-only-l vardel_ip_quarzel | sed s/-lvardel_ip_quarzel//)
expect "plain gcc, archive, with what the .pc file says that it needs" "$work/static"

# A project of C alone gets what the archive needs from its target.
cmake -S "$source/tests/install/c_consumer" -B "$work/c_only" -DCMAKE_PREFIX_PATH="$prefix" >>"$work/log"
cmake --build "$work/c_only" >>"$work/log"
expect "CMake, archive in a project of C alone" "$work/c_only/decode_block"

# Pages, licence, examples, and the packages for pip and pkg.
for file in doc/quarzel/README.md doc/quarzel/LICENSE doc/quarzel/docs/octave.md doc/quarzel/examples/decode_block.c; do
    test -s "$prefix/share/$file"
done
if [ -d "$build/bindings/python/dist" ]; then
    test "$(find "$prefix/share/quarzel/python" -name 'quarzel-*.whl' | wc -l)" -eq 1
fi
if [ -d "$build/bindings/octave/package" ]; then
    test "$(find "$prefix/share/quarzel/octave" -name 'quarzel-octave-*.tar.gz' | wc -l)" -eq 1
fi
echo "ok: pages, licence, examples, wheel and Octave package"

# Every installed header of the classes compiles alone.
while read -r header; do
    echo "#include <$header>" | g++ -std=c++20 -x c++ -fsyntax-only -I"$prefix/include" -I"$prefix/include/quarzel" -
done < <(cd "$prefix/include/quarzel" && find . -name '*.hpp')
echo "ok: every header compiles alone"
