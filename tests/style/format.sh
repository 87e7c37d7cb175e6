#!/usr/bin/env bash
# SPDX-License-Identifier: MIT
# Every source is as clang-format leaves it: format.sh SOURCE
set -euo pipefail
cd "$1"
find include src link sweep tools bindings tests fuzz bench examples -name '*.[ch]' -o -name '*.[ch]pp' | xargs clang-format --dry-run -Werror
