# Thin wrapper over CMake. Every target installs missing Debian packages first.
BUILD_TEST ?= build/test
JOBS ?= 2

.PHONY: all deps test clean

all: test

deps:
	@bash scripts/install-deps.sh

# The test build runs under AddressSanitizer and UndefinedBehaviorSanitizer.
test: deps
	cmake -S . -B $(BUILD_TEST) -G Ninja -DCMAKE_BUILD_TYPE=Debug -DPELMO_SANITIZE=ON -DPELMO_BUILD_TESTS=ON
	cmake --build $(BUILD_TEST) -j $(JOBS)
	cd $(BUILD_TEST) && ctest --output-on-failure -j $(JOBS)

clean:
	rm -rf build
