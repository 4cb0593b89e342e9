# The two commands of the README, and a few more.
#   make demo    build, install into ./dist and run the example
#   make test    build everything and run every test
BUILD      ?= build
PREFIX     ?= $(CURDIR)/dist
JOBS       ?= $(shell nproc)
CMAKE_ARGS ?=

.PHONY: all deps configure build test test-sanitize test-valgrind test-fuzz fuzz demo install bench clean

all: build

deps:
	@scripts/install-deps.sh

configure: deps
	@cmake -S . -B $(BUILD) -DCMAKE_INSTALL_PREFIX=$(PREFIX) -DULK_WERROR=ON $(CMAKE_ARGS) >/dev/null

build: configure
	@cmake --build $(BUILD) -j $(JOBS)

test: build
	@cd $(BUILD) && ctest --output-on-failure -j $(JOBS)
	@$(MAKE) --no-print-directory test-sanitize
	@$(MAKE) --no-print-directory test-valgrind
	@$(MAKE) --no-print-directory test-fuzz

# The whole suite again under AddressSanitizer and UndefinedBehaviorSanitizer.
test-sanitize: deps
	@cmake -S . -B $(BUILD)-sanitize -DULK_SANITIZE=ON -DULK_WERROR=ON -DCMAKE_BUILD_TYPE=Debug $(CMAKE_ARGS) >/dev/null
	@cmake --build $(BUILD)-sanitize -j $(JOBS)
	@cd $(BUILD)-sanitize && ASAN_OPTIONS=detect_leaks=1 UBSAN_OPTIONS=print_stacktrace=1 \
		ctest --output-on-failure -j $(JOBS)

# The library's own test programs once under valgrind's memcheck (on the normal build).
test-valgrind: build
	@scripts/valgrind-tests.sh $(BUILD)

# The libFuzzer targets briefly (a clang build of their own); `make fuzz` runs them long.
FUZZ_SECONDS ?= 20
test-fuzz: deps
	@JOBS=$(JOBS) scripts/fuzz.sh $(FUZZ_SECONDS) $(BUILD)-fuzz

fuzz: deps
	@JOBS=$(JOBS) scripts/fuzz.sh 600 $(BUILD)-fuzz

install: build
	@cmake --install $(BUILD) >/dev/null
	@echo "Installed the ULK SDK into $(PREFIX)"

demo: install
	@scripts/demo.sh $(PREFIX)

bench: deps
	@cmake -S . -B $(BUILD)-bench -DCMAKE_BUILD_TYPE=Release -DULK_BUILD_BENCH=ON -DULK_BUILD_TESTS=OFF >/dev/null
	@cmake --build $(BUILD)-bench -j $(JOBS)
	@scripts/bench.sh $(BUILD)-bench

clean:
	@rm -rf $(BUILD) $(BUILD)-* $(PREFIX)
