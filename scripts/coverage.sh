#!/usr/bin/env bash
# SPDX-License-Identifier: MIT
# Measure what the library's tests reach of it: coverage.sh
# Prints a table of its files, then each line, each way of a branch and each condition that no test reaches on this
# processor, where a template counts as reached when one of its forms is. docs/verification.md gives the reasons.
set -euo pipefail
cd "$(dirname "$0")/.."
build=build/coverage
cmake -G Ninja -S . -B $build -DCMAKE_BUILD_TYPE=Debug -DQUARZEL_TOOL=OFF -DQUARZEL_HARDEN=OFF \
    -DCMAKE_C_COMPILER=clang-19 -DCMAKE_CXX_COMPILER=clang++-19 \
    -DCMAKE_CXX_FLAGS_DEBUG='-O1 -fprofile-instr-generate -fcoverage-mapping -fcoverage-mcdc' \
    -DCMAKE_GTEST_DISCOVER_TESTS_DISCOVERY_MODE=PRE_TEST >$build.log
rooms=(fixed interleaver engine decoder interface lanes oracle)
cmake --build $build --target $(printf "tests/%s/all " "${rooms[@]}") >>$build.log 2>&1 || { tail -40 $build.log >&2; exit 1; }
rm -rf $build/profiles
objects=()
for program in $(printf "$build/tests/%s/*_test " "${rooms[@]}"); do
    LLVM_PROFILE_FILE=$build/profiles/%p-%m.profraw "$program" >>$build.log 2>&1 || { tail -40 $build.log >&2; exit 1; }
    objects+=(-object "$program")
done
llvm-profdata-19 merge -o $build/profile $build/profiles/*.profraw
llvm-cov-19 report "${objects[@]}" -instr-profile=$build/profile -show-mcdc-summary -sources src
llvm-cov-19 export "${objects[@]}" -instr-profile=$build/profile -format=lcov -sources src |
    awk -F'[:,]' -v root="$PWD/" '/^SF:/ { file = substr($2, length(root) + 1) }
                                  /^DA:/ && $3 == 0 { print "line never reached: " file ":" $2 }'
llvm-cov-19 export "${objects[@]}" -instr-profile=$build/profile -sources src | jq -r --arg root "$PWD/" '
    .data[0].files[] | (.filename | ltrimstr($root)) as $file |
    (.branches | group_by(.[0:4])[] | (map(.[4]) | max) as $true | (map(.[5]) | max) as $false |
        select(($true == 0) != ($false == 0)) |
        "branch never \(if $true == 0 then "taken" else "passed by" end): \($file):\(.[0][0]):\(.[0][1])"),
    (.mcdc_records | group_by(.[0:4])[] | select(map(.[-1]) | transpose | map(any) | all | not) |
        "condition never alone decisive: \($file):\(.[0][0]):\(.[0][1])")'
