#!/usr/bin/env bash
# SPDX-License-Identifier: MIT
# The checks that take an hour or two: test-long.sh [PART...]
set -euo pipefail
cd "$(dirname "$0")/.."
. scripts/check_parts.sh

part_proofs() { /usr/bin/python3 tests/proofs/lane_bounds.py .; }
part_docs() { make docs; }
part_analyser() {
    scripts/build.sh bench
    scripts/build.sh release
    tests/style/lint.sh . build/release --analyse
}
part_whole_domains() {
    scripts/build.sh release
    QUARZEL_TEST_EXHAUSTIVE=1 ctest --preset release \
        -R 'Lane|DecodeGrid|Frozen|PlainDecoder|CoveringBlocks|MaxStar|Wrap16|RateMatching|RateRecovery|Segmentation|TurboEncoding'
}
part_slurm() {
    scripts/build.sh release
    tests/sweep/slurm_test.sh . build/release
}
part_without_tool() { tests/bindings/without_tool.sh . build/without-tool; }
part_pip() { tests/bindings/python/pip_test.sh . /usr/bin/python3 python lte cocotb python_sweeps; }
part_packages() {
    scripts/package.sh
    tests/install/packages_test.sh build/package
}
part_pages() { tests/install/pages_test.sh .; }
part_sanitized_tool() {
    scripts/build.sh sanitize-tool
    ctest --preset sanitize-tool
}
part_aarch64() {
    scripts/build.sh aarch64
    ctest --preset aarch64
}

parts=(proofs docs analyser whole_domains slurm without_tool pip packages pages sanitized_tool aarch64)
[ $# -gt 0 ] || set -- "${parts[@]}"
scripts/install-packages.sh long
run_parts test-long no "$@"
