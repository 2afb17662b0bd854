# Thin wrapper over CMake. Every target installs missing Debian packages first.
BUILD_TEST ?= build/test
BUILD_BENCH ?= build/bench
JOBS ?= 2

.PHONY: all deps test bench clean

all: test

deps:
	@bash scripts/install-deps.sh

# The test build runs under AddressSanitizer and UndefinedBehaviorSanitizer.
test: deps
	cmake -S . -B $(BUILD_TEST) -G Ninja -DCMAKE_BUILD_TYPE=Debug -DPELMO_SANITIZE=ON -DPELMO_BUILD_TESTS=ON
	cmake --build $(BUILD_TEST) -j $(JOBS)
	cd $(BUILD_TEST) && ctest --output-on-failure -j $(JOBS)

# Benchmarks build optimised and without sanitizers; each prints its figures.
bench: deps
	cmake -S . -B $(BUILD_BENCH) -G Ninja -DCMAKE_BUILD_TYPE=Release -DPELMO_BUILD_TESTS=OFF -DPELMO_BUILD_BENCH=ON
	cmake --build $(BUILD_BENCH) -j $(JOBS)
	@for b in $(BUILD_BENCH)/bench/*_bench; do echo "== $$b"; "$$b" || exit 1; done

clean:
	rm -rf build
