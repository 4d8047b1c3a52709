# Entry points: `make run` builds the tool and runs it on the bundled example;
# `make test` builds and runs every test, plainly and under the sanitizers.
JOBS ?= $(shell nproc)
DEB_PACKAGES := cmake ninja-build g++ clang libgtest-dev libgmock-dev libcli11-dev libbenchmark-dev locales python3 libdxflib-dev python3-ezdxf libproj-dev proj-data proj-bin libeigen3-dev gdal-bin gcovr

.PHONY: all deps build run test test-release test-asan coverage bench fuzz lint clean

all: build

# Installs what the build needs from Debian's packages when it is missing.
deps:
	@missing=""; for p in $(DEB_PACKAGES); do \
	  dpkg -s $$p >/dev/null 2>&1 || missing="$$missing $$p"; done; \
	if [ -n "$$missing" ]; then \
	  echo "installing:$$missing"; \
	  SUDO=""; [ "$$(id -u)" -ne 0 ] && SUDO=sudo; \
	  $$SUDO apt-get update -qq && DEBIAN_FRONTEND=noninteractive $$SUDO apt-get install -y -qq $$missing; \
	fi

build: deps
	cmake --preset release >/dev/null
	cmake --build --preset release -j $(JOBS)

run: build
	./build/release/bin/carnet check examples/chantier.geo
	./build/release/bin/carnet list --numbers examples/chantier.geo
	./build/release/bin/carnet show examples/chantier.geo --type Point
	./build/release/bin/carnet export examples/chantier.geo --to svg -o build/chantier.svg
	./build/release/bin/carnet projection examples/chantier.geo
	./build/release/bin/carnet export examples/chantier.geo --to geojson -o build/chantier.geojson

test: test-release test-asan

test-release: deps
	cmake --preset release >/dev/null
	cmake --build --preset release -j $(JOBS)
	ctest --preset release -j $(JOBS)

test-asan: deps
	cmake --preset asan >/dev/null
	cmake --build --preset asan -j $(JOBS)
	ctest --preset asan -j $(JOBS)

# Line and branch coverage of the library (all of src/) by the whole test
# suite, the tool's tests and the corpus replays included: counters start
# from zero, the table of lines per file goes to build/coverage/coverage.txt, the sums
# are printed. Branches that only throw or that the compiler made unreachable
# are not counted.
coverage: deps
	cmake --preset coverage >/dev/null
	cmake --build --preset coverage -j $(JOBS)
	find build/coverage -name '*.gcda' -delete
	ctest --preset coverage -j $(JOBS) >build/coverage/ctest.log || { tail -n 30 build/coverage/ctest.log; exit 1; }
	gcovr --root . --filter 'src/' --exclude-throw-branches --exclude-unreachable-branches \
	  --gcov-exclude '.*CompilerId.*' --object-directory build/coverage --txt build/coverage/coverage.txt \
	  --print-summary build/coverage | tail -n 3

# Benchmarks against the cost of merely reading and writing the same bytes,
# then their ratios; never part of `make test`.
bench: deps
	cmake --preset bench >/dev/null
	cmake --build --preset bench -j $(JOBS) --target carnet_bench
	./build/bench/bin/carnet_bench --benchmark_repetitions=3 --benchmark_out=build/bench/results.json --benchmark_out_format=json
	python3 bench/ratios.py build/bench/results.json

# Fuzzes each target for FUZZ_SECONDS (60 by default) and reports executions,
# coverage and findings (fuzz/README.md); never part of `make test`, which
# replays the seed corpora instead.
FUZZ_SECONDS ?= 60
fuzz: deps
	cmake --preset fuzz >/dev/null
	cmake --build --preset fuzz -j $(JOBS)
	FUZZ_SECONDS=$(FUZZ_SECONDS) fuzz/run.sh

# Static checks of the library, both silent on a clean tree: clang-tidy with
# the checks of src/.clang-tidy (likely bugs, needless costs, the analyzer),
# and cppcheck's warnings, performance and portability checks.
LINT_PACKAGES := clang-tidy cppcheck
lint: deps
	@$(MAKE) --no-print-directory deps DEB_PACKAGES="$(LINT_PACKAGES)"
	cmake -S . -B build/lint -G Ninja -DCMAKE_CXX_COMPILER=clang++ -DCARNET_BUILD_TESTS=OFF -DCARNET_BUILD_TOOL=OFF >/dev/null
	run-clang-tidy -p build/lint -j $(JOBS) -quiet '$(CURDIR)/src/.*\.cpp$$'
	cppcheck --enable=warning,performance,portability --std=c++17 --language=c++ --inline-suppr --quiet \
	  --error-exitcode=1 -j $(JOBS) -I src -I build/lint/include src

clean:
	rm -rf build
