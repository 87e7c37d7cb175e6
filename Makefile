# SPDX-License-Identifier: MIT
# The commands of the README. Each does its own set-up.
.PHONY: help demo test test-long test-release bench docs package validate atlas format

help:
	@echo "make demo       install what is missing, build, and decode the captures that come with the project"
	@echo "make test       install what is missing, build, and run every test, the library's again under sanitizers"
	@echo "make test-long  the checks that take an hour or two: the tool with sanitizers, 64-bit Arm, whole domains, proofs, Slurm, bindings without the tool, the analyser"
	@echo "make test-release  the checks of a release, a night: both above, compilers, old processors, fuzzers"
	@echo "make bench      build and run the benchmarks"
	@echo "make docs       build the site of the pages and the headers in build/docs/site, with its links checked"
	@echo "make package    build the Debian packages in build/package, and ask lintian about them"
	@echo "make validate   simulate and draw docs/validation.md anew, a quarter of an hour"
	@echo "make atlas      compute and draw docs/atlas.md anew, more than an hour of processor time"
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
	@scripts/test-long.sh

test-release:
	@scripts/test-release.sh

bench:
	@scripts/install-packages.sh test
	@scripts/build.sh bench
	build/release/bench/quarzel_bench --benchmark_out=build/release/bench.json --benchmark_out_format=json
	build/release/bench/quarzel_sweep_bench
	bench/bindings.sh

docs:
	@scripts/install-packages.sh docs
	@/usr/bin/python3 scripts/site_pages.py . build/docs/pages
	@mkdocs build --strict --quiet --config-file docs/site/mkdocs.yml

package:
	@scripts/install-packages.sh package
	@scripts/package.sh

validate:
	@scripts/install-packages.sh test
	@scripts/build.sh release
	@scripts/build.sh bench
	@scripts/validate.sh

atlas:
	@scripts/install-packages.sh test
	@scripts/build.sh release
	@scripts/atlas.sh

format:
	@scripts/install-packages.sh test
	git ls-files '*.c' '*.h' '*.cpp' '*.hpp' | xargs clang-format -i
