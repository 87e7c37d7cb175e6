#!/usr/bin/env bash
# SPDX-License-Identifier: MIT
# clang-tidy finds nothing in the library: lint.sh SOURCE BUILD [--analyse]
# --analyse: instead, the static analyser finds nothing in the library and the tool, which takes a quarter of an hour.
set -euo pipefail
cd "$1"
options=()
folders=(src)
if [ "${3:-}" = --analyse ]; then
    options=(--checks='-*,clang-analyzer-*,-clang-analyzer-optin.*')
    folders+=(link sweep tools/quarzel)
fi
find "${folders[@]}" -name '*.cpp' | xargs -P "$(nproc)" -n 4 clang-tidy -p "$2" --quiet "${options[@]}"
