#!/usr/bin/env bash
# SPDX-License-Identifier: MIT
# Do what the pages tell a new user to do, word for word, as root of a machine that has nothing yet: follow_pages.sh
# It installs packages and the project itself: run it through pages_test.sh.
set -euo pipefail
project=$(cd "$(dirname "$0")/../.." && pwd)
. "$project/tests/support/page_blocks.sh"
empty=$(mktemp -d)

# Run lines as they stand, in a folder: follow FOLDER LINES
follow() {
    (cd "$1" && bash -euo pipefail -c "$2") >"$empty/log" 2>"$empty/errors" || {
        printf 'these lines of %s fail:\n%s\n' "$page" "$2" >&2
        cat "$empty/log" "$empty/errors" >&2
        exit 1
    }
}
# What was printed is what the page says: printed EXPECTED
printed() {
    diff <(echo "$1") "$empty/log"
    echo "ok: $page"
}

page=README.md
follow "$project" "make demo"
printed_by_demo=$(tail -n 1 "$empty/log")
[ "$printed_by_demo" = "Every decision is the core's. The errors left are those of the noise." ]
follow "$project" "scripts/install-packages.sh test"
follow "$project" "$(blocks README.md sh Install | sed '/^gcc/,$d')"
blocks README.md c "From C" >"$empty/decode_block.c"
for line in 1 2; do
    follow "$empty" "$(blocks README.md sh Install | grep ^gcc | sed -n ${line}p); ./a.out"
    [ "$(cat "$empty/log")" = "status 0, 40 bits, first bit 0, tag 1" ]
done
echo "ok: $page"

for page in docs/python.md docs/octave.md docs/systemverilog.md; do
    install=$(sed -n 's/^## \(Install.*\)/\1/p' "$project/$page" | head -n 1)
    follow "$project" "$(blocks $page sh "$install")"
    case $page in
    docs/python.md)
        for page in docs/python.md docs/lte.md docs/cocotb.md docs/python_sweeps.md; do
            follow "$empty" "$project/env/bin/python $project/tests/bindings/run_page.py $project/$page"
            echo "ok: $page"
        done
        ;;
    docs/octave.md)
        blocks $page octave >"$empty/first_block.m"
        follow "$empty" "octave-cli --quiet --eval 'pkg load quarzel; first_block'"
        printed "$(blocks $page text)"
        ;;
    docs/systemverilog.md)
        blocks $page systemverilog "The first block" >"$empty/first.sv"
        follow "$empty" "$(blocks $page sh "The first block" | sed 's/-o first/& >build.log/')"
        sed -i '/Verilog \$finish$/d' "$empty/log" # the simulator's own line
        printed "$(blocks $page text "The first block")"
        page=docs/vhdl.md
        blocks $page vhdl "The first block" >"$empty/first.vhd"
        follow "$empty" "$(blocks $page sh "The first block")"
        printed "$(blocks $page text)"
        ;;
    esac
done
