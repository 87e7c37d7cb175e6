#!/usr/bin/env bash
# SPDX-License-Identifier: MIT
# Run the commands of docs/debugging.md, chapter by chapter, and compare what they print with the page:
# debugging_page_test.sh SOURCE TOOL
set -euo pipefail
project=$1
tool=$2
. "$project/tests/support/page_blocks.sh"
page=docs/debugging.md
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
cd "$work"
mkdir bin
ln -s "$tool" bin/quarzel
ln -s "$project/examples" examples
PATH=$work/bin:$PATH

chapters=0
while read -r chapter; do
    commands=$(blocks $page sh "$chapter")
    [ -n "$commands" ] || continue
    bash -c "$commands" >printed 2>&1 || true # a bench that fails, and traces that differ
    diff -u <(blocks $page text "$chapter") printed
    chapters=$((chapters + 1))
    echo "ok: $chapter"
done < <(sed -n 's/^## //p' "$project/$page")
[ "$chapters" -eq 5 ]
