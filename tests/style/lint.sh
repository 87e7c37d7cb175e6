#!/usr/bin/env bash
# SPDX-License-Identifier: MIT
# clang-tidy finds nothing in the library: lint.sh SOURCE BUILD
set -euo pipefail
cd "$1"
find src -name '*.cpp' | xargs -P "$(nproc)" -n 4 clang-tidy -p "$2" --quiet
