# SPDX-License-Identifier: MIT
# The commands of the README. Each does its own set-up.
.PHONY: help demo test bench format

help:
	@echo "make demo    install what is missing, build, and decode the captures that come with the project"
	@echo "make test    install what is missing, build, and run every test, plain and with sanitizers"
	@echo "make bench   build and run the benchmarks"
	@echo "make format  format the sources"

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

bench:
	@scripts/install-packages.sh test
	@scripts/build.sh release
	build/release/bench/quarzel_bench --benchmark_out=build/release/bench.json --benchmark_out_format=json
	build/release/bench/quarzel_sweep_bench

format:
	@scripts/install-packages.sh test
	git ls-files '*.c' '*.h' '*.cpp' '*.hpp' | xargs clang-format -i
