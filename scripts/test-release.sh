#!/usr/bin/env bash
# SPDX-License-Identifier: MIT
# The checks of a release, which take a night: test-release.sh [PART...]
# A run that was interrupted goes on where it was: parts that have passed at this commit are not run again.
set -euo pipefail
cd "$(dirname "$0")/.."
. scripts/check_parts.sh

# The frozen decisions without the decoder written anew, which is the same everywhere and takes longest.
product=--gtest_filter=-*WrittenAnew*

part_test() { make test; }
part_long() { scripts/test-long.sh; }
# Without AVX2, without AVX, and without SSSE3 and SSE4.1.
part_old_processors() {
    scripts/build.sh release
    for processor in IvyBridge Nehalem Opteron_G1; do
        QUARZEL_TEST_EXHAUSTIVE=1 qemu-x86_64 -cpu $processor \
            build/release/tests/frozen/frozen_decisions_test --gtest_brief=1 $product
    done
}
# The frozen decisions on other processors, emulated, one of them big endian; and the library's tests on those without
# lanes of their own (test-long has them for aarch64).
part_other_processors() {
    scripts/build.sh release
    local processor emulator
    for processor in aarch64 armhf ppc64le riscv64 s390x; do
        scripts/build.sh $processor
        [ $processor = aarch64 ] || ctest --preset $processor
        emulator=$(sed -n 's/^CMAKE_CROSSCOMPILING_EMULATOR:[^=]*=//p' build/$processor/CMakeCache.txt | tr ';' ' ')
        QUARZEL_TEST_EXHAUSTIVE=1 QUARZEL_FROZEN_DECODER="$emulator build/$processor/tests/frozen/frozen_decoder" \
            build/release/tests/frozen/frozen_decisions_test --gtest_filter='*AnotherProcessor*'
    done
}
# Every entry of the frozen decisions from each compiler at each level.
part_compilers() {
    for compiler in gcc,g++ clang,clang++; do
        for flags in -O0 -O2 -O3 '-O2 -flto'; do
            build=build/compilers/${compiler%,*}$(tr -d ' ' <<<"$flags")
            cmake -G Ninja -S . -B "$build" -DCMAKE_BUILD_TYPE=Release -DQUARZEL_HARDEN=OFF \
                -DQUARZEL_LANES_LEVEL="${flags% *}" \
                -DCMAKE_C_COMPILER="${compiler%,*}" -DCMAKE_CXX_COMPILER="${compiler#*,}" \
                -DCMAKE_C_FLAGS_RELEASE="$flags -DNDEBUG" -DCMAKE_CXX_FLAGS_RELEASE="$flags -DNDEBUG"
            cmake --build "$build" --target frozen_decisions_test
            QUARZEL_TEST_EXHAUSTIVE=1 "$build/tests/frozen/frozen_decisions_test" --gtest_brief=1 $product
        done
    done
}
# The decisions of 10^7 blocks beside the decoder written anew.
part_third_opinion() {
    scripts/build.sh release
    QUARZEL_TEST_BLOCKS=10000000 build/release/tests/oracle/plain_decoder_test --gtest_filter='*DecidesAsTheCoreDoes'
}
part_thread_sanitizer() {
    cmake -G Ninja -S . -B build/threads -DCMAKE_BUILD_TYPE=Debug -DCMAKE_CXX_FLAGS_DEBUG='-O1 -g1 -fsanitize=thread' \
        -DCMAKE_C_COMPILER=clang -DCMAKE_CXX_COMPILER=clang++
    cmake --build build/threads --target hostile_host_test link_test
    build/threads/tests/interface/hostile_host_test --gtest_filter='*32Threads*'
    build/threads/tests/link/link_test --gtest_filter='ForEachOnThreads*'
}
# No integer changes its value by an overflow or a conversion but where it is meant to.
part_integer_sanitizer() {
    export LD_LIBRARY_PATH
    LD_LIBRARY_PATH=$(clang -print-runtime-dir)
    cmake -G Ninja -S . -B build/integers -DCMAKE_BUILD_TYPE=Debug -DQUARZEL_TOOL=OFF -DQUARZEL_BINDINGS=OFF \
        -DCMAKE_C_COMPILER=clang -DCMAKE_CXX_COMPILER=clang++ \
        -DCMAKE_CXX_FLAGS_DEBUG="-O1 -g1 -fsanitize=integer,implicit-conversion,local-bounds -shared-libsan \
            -fno-sanitize-recover=all -fsanitize-ignorelist=$PWD/tests/deliberate_wraps.txt"
    cmake --build build/integers
    ctest --test-dir build/integers --output-on-failure --no-tests=error -j 2 -E Style
}
# The library and its tests compiled by Clang 19, warnings as errors, and what the tests reach.
part_coverage() { scripts/coverage.sh; }
# Other mutants in each release; a run that was interrupted goes on with those of its commit.
part_mutation() { tests/mutation/mutate.py --seed $((16#$(git rev-parse --short=6 HEAD | cut -c1-6))); }
part_reproducible() { scripts/reproducible.sh; }
part_memcheck() {
    scripts/build.sh release
    for test in stored_calls_test simulate_test messages_test; do
        valgrind --quiet --error-exitcode=1 --leak-check=full build/release/tests/interface/$test --gtest_brief=1
    done
}
part_fuzz_calls() { scripts/fuzz.sh 1000000 c_interface differential library_text options rate_recovery; }
part_fuzz_readers() {
    scripts/fuzz.sh 10000000 bits_files captures manifests memory_files reference_curves results traces
}

parts=(test long old_processors other_processors compilers third_opinion thread_sanitizer integer_sanitizer
    coverage reproducible memcheck mutation fuzz_calls fuzz_readers)
[ $# -gt 0 ] || set -- "${parts[@]}"
scripts/install-packages.sh long
run_parts test-release yes "$@"
