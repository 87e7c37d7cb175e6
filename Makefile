# SPDX-License-Identifier: MIT
# The commands of the README. Each does its own set-up.
.PHONY: help demo test test-long bench format

help:
	@echo "make demo       install what is missing, build, and decode the captures that come with the project"
	@echo "make test       install what is missing, build, and run every test, the library's with sanitizers, too"
	@echo "make test-long  the checks that take an hour or two: the tool with sanitizers, 64-bit Arm, whole domains, bindings without the tool, the analyser"
	@echo "make bench      build and run the benchmarks"
	@echo "make format     format the sources"

demo:
	@scripts/install-packages.sh demo
	@scripts/build.sh demo
	@scripts/demo.sh build/release/tools/quarzel/quarzel examples/captures

test:
	@scripts/install-packages.sh test
	@scripts/build.sh release
	@ctest --preset release
	@scripts/build.sh sanitize
	@ctest --preset sanitize

test-long:
	@scripts/install-packages.sh long
	@scripts/build.sh bench
	@scripts/build.sh release
	@tests/style/lint.sh . build/release --analyse
	@QUARZEL_TEST_EXHAUSTIVE=1 ctest --preset release -R 'Lane|DecodeGrid|MaxStar|Wrap16|RateMatching|RateRecovery|Segmentation|TurboEncoding'
	@tests/bindings/without_tool.sh . build/without-tool
	@scripts/build.sh sanitize-tool
	@ctest --preset sanitize-tool
	@scripts/build.sh aarch64
	@ctest --preset aarch64

bench:
	@scripts/install-packages.sh test
	@scripts/build.sh bench
	build/release/bench/quarzel_bench --benchmark_out=build/release/bench.json --benchmark_out_format=json
	build/release/bench/quarzel_sweep_bench
	bench/bindings.sh

format:
	@scripts/install-packages.sh test
	git ls-files '*.c' '*.h' '*.cpp' '*.hpp' | xargs clang-format -i
