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

# A list of the packages of its own: the machine's, which root would write to, stays as it is.
lists() { "$octave" --no-history --quiet --no-init-file --eval 'cellfun (@disp, {pkg("local_list"), pkg("global_list")})'; }
checksums() { lists | xargs -d '\n' sha256sum 2>&1 || true; }
before=$(checksums)
own="pkg local_list $work/list; pkg global_list $work/global_list; pkg prefix $work/packages $work/packages;"
run() { "$octave" --no-history --quiet --no-init-file --eval "$own $1"; }

mkdir "$work/packages"
run "pkg install -local $package" >"$work/pkg" 2>&1 || {
    cat "$work/pkg" >&2
    exit 1
}
if [ -s "$work/pkg" ]; then
    echo "pkg install said:" >&2
    cat "$work/pkg" >&2
    exit 1
fi
if [ "$before" != "$(checksums)" ]; then
    echo "the machine's list of packages was changed" >&2
    exit 1
fi
echo "ok: pkg install, silent, with a list of its own"

# The page's first block is run, and prints what the page says.
awk '/^```octave$/ { code = 1; next } /^```$/ { code = 0 } code' "$source/docs/octave.md" >first_block.m
awk '/^```text$/ { text = 1; next } /^```$/ { text = 0 } text' "$source/docs/octave.md" >expected
run "pkg load quarzel; first_block" >printed
diff expected printed
echo "ok: octave.md"

run "pkg load quarzel; help quarzel_decode" | grep -q "POSITIVE MEANS BIT 1"
run "pkg load quarzel; help quarzel_encode" | grep -q "Encode LTE code blocks"
run "pkg load quarzel; help quarzel_mex" | grep -q "not to be called directly"
echo "ok: help"

# Ctrl-C ends a call that would take minutes, in much less than the 20 s after which the test gives up.
cat >long_call.m <<'END'
soft = repmat ({zeros(6148, 20000, 'int8')}, 1, 3);
puts ("decoding\n"); fflush (stdout ());
for i = 1:1000
  quarzel_decode (soft{:}, 15);
end
puts ("not interrupted\n");
END
"$octave" --no-history --quiet --no-init-file --eval "$own pkg load quarzel; long_call" >interrupted 2>&1 &
call=$!
for _ in $(seq 600); do
    ! grep -q decoding interrupted || break
    sleep 0.1
done
sleep 0.3
kill -INT "$call"
for _ in $(seq 200); do
    kill -0 "$call" 2>/dev/null || break
    sleep 0.1
done
if kill -9 "$call" 2>/dev/null || grep -q "not interrupted" interrupted; then
    echo "Ctrl-C did not end the call" >&2
    cat interrupted >&2
    exit 1
fi
echo "ok: Ctrl-C"
