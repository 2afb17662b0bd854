# Thin wrapper over CMake. Every target installs missing Debian packages first.
BUILD_TEST ?= build/test
BUILD_FUZZ ?= build/fuzz
BUILD_BENCH ?= build/bench
BUILD_RUN ?= build/run
BUILD_RELEASE ?= build/release
PREFIX ?= /usr/local
JOBS ?= 2
FUZZ_SECONDS ?= 60

.PHONY: all deps run install deb test bench fuzz mutants clean

all: test

deps:
	@bash scripts/install-deps.sh

# Builds Pelmo (debug, no sanitizers) and opens its window.
run: deps
	cmake -S . -B $(BUILD_RUN) -G Ninja -DCMAKE_BUILD_TYPE=Debug -DPELMO_BUILD_TESTS=OFF
	cmake --build $(BUILD_RUN) -j $(JOBS) --target pelmo
	$(BUILD_RUN)/src/pelmo

# Builds Pelmo optimised and installs the program, its desktop entry, metainfo, icons, manual
# page and README under $(PREFIX); DESTDIR=DIR stages them in DIR instead.
install: deps
	cmake -S . -B $(BUILD_RELEASE) -G Ninja -DCMAKE_BUILD_TYPE=Release -DPELMO_BUILD_TESTS=OFF
	cmake --build $(BUILD_RELEASE) -j $(JOBS)
	cmake --install $(BUILD_RELEASE) --prefix $(PREFIX)

# Builds Pelmo optimised and packages it as $(BUILD_RELEASE)/pelmo_<version>_amd64.deb, installed
# under /usr, its dependencies worked out by dpkg-shlibdeps.
deb: deps
	cmake -S . -B $(BUILD_RELEASE) -G Ninja -DCMAKE_BUILD_TYPE=Release -DPELMO_BUILD_TESTS=OFF
	cmake --build $(BUILD_RELEASE) -j $(JOBS)
	cd $(BUILD_RELEASE) && cpack -G DEB

# The test build runs under AddressSanitizer and UndefinedBehaviorSanitizer.
test: deps
	cmake -S . -B $(BUILD_TEST) -G Ninja -DCMAKE_BUILD_TYPE=Debug -DPELMO_SANITIZE=ON -DPELMO_BUILD_TESTS=ON
	cmake --build $(BUILD_TEST) -j $(JOBS)
	cd $(BUILD_TEST) && ctest --output-on-failure -j $(JOBS)

# Builds the libFuzzer targets with clang and runs each for FUZZ_SECONDS, keeping its corpus in
# $(BUILD_FUZZ)/corpus/<target> (started from tests/data/fuzz/<target> on the first run) and
# anything it finds in $(BUILD_FUZZ)/artifacts/.
fuzz: deps
	CC=clang CXX=clang++ cmake -S . -B $(BUILD_FUZZ) -G Ninja -DCMAKE_BUILD_TYPE=RelWithDebInfo \
	  -DPELMO_FUZZ=ON -DPELMO_BUILD_TESTS=OFF
	cmake --build $(BUILD_FUZZ) -j $(JOBS)
	@set -e; for target in $(BUILD_FUZZ)/fuzzers/*; do \
	  name=$$(basename $$target); \
	  if [ ! -d $(BUILD_FUZZ)/corpus/$$name ] && [ -d tests/data/fuzz/$$name ]; then \
	    mkdir -p $(BUILD_FUZZ)/corpus && cp -r tests/data/fuzz/$$name $(BUILD_FUZZ)/corpus/; \
	  fi; \
	  mkdir -p $(BUILD_FUZZ)/corpus/$$name $(BUILD_FUZZ)/artifacts; \
	  echo "fuzz: $$name for $(FUZZ_SECONDS) s"; \
	  $$target -max_total_time=$(FUZZ_SECONDS) -print_final_stats=1 \
	    -artifact_prefix=$(BUILD_FUZZ)/artifacts/$$name- $(BUILD_FUZZ)/corpus/$$name; \
	done

# Benchmarks build optimised and without sanitizers; each prints its figures.
bench: deps
	cmake -S . -B $(BUILD_BENCH) -G Ninja -DCMAKE_BUILD_TYPE=Release -DPELMO_BUILD_TESTS=OFF -DPELMO_BUILD_BENCH=ON
	cmake --build $(BUILD_BENCH) -j $(JOBS)
	@for b in $(BUILD_BENCH)/bench/*_bench; do echo "== $$b"; "$$b" || exit 1; done
	@echo "== scripts/bench-startup.sh"; bash scripts/bench-startup.sh $(BUILD_BENCH)/src/pelmo
	@echo "== scripts/bench-relink.sh"; bash scripts/bench-relink.sh $(BUILD_BENCH)/src/pelmo
	@echo "== scripts/bench-send.sh"; bash scripts/bench-send.sh $(BUILD_BENCH)/src/pelmo
	@echo "== scripts/bench-tls.sh"; bash scripts/bench-tls.sh $(BUILD_BENCH)/src/pelmo

# Plants each fault of scripts/mutants.list in a copy of the tree under build/mutants, one at a
# time, and tells how many the tests catch. MUTANTS=3,7,12-20,smtp runs only those.
mutants: deps
	JOBS=$(JOBS) MUTANTS=$(MUTANTS) bash scripts/mutants.sh

clean:
	rm -rf build
