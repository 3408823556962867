# The two commands a new user needs: `make demo` and `make test`. Each installs what is missing
# (scripts/install-deps), configures, builds and runs.
BUILD      ?= build
ASAN_BUILD ?= build-asan
TSAN_BUILD ?= build-tsan
BENCH_BUILD ?= build-bench
FUZZ_BUILD ?= build-fuzz
JOBS       ?= $(shell nproc)
FUZZ_SECONDS ?= 30
CMAKE_FLAGS ?=

.PHONY: all deps build test test-sanitize test-tsan demo gallery bench fuzz fuzz-smoke format clean

all: build

deps:
	@scripts/install-deps

$(BUILD)/build.ninja:
	cmake -S . -B $(BUILD) -G Ninja $(CMAKE_FLAGS)

# Flags given on the command line reach a build folder that is already configured, too.
build: deps $(BUILD)/build.ninja
	$(if $(CMAKE_FLAGS),cmake -S . -B $(BUILD) -G Ninja $(CMAKE_FLAGS) >/dev/null)
	cmake --build $(BUILD) -j $(JOBS)

# The threaded label repeats cases the suites already run; it is for test-tsan.
test: build
	ctest --test-dir $(BUILD) --output-on-failure -j $(JOBS) -LE threaded

$(ASAN_BUILD)/build.ninja:
	cmake -S . -B $(ASAN_BUILD) -G Ninja -DCMAKE_BUILD_TYPE=Debug -DPLOTAID_SANITIZE=ON -DPLOTAID_BUILD_BENCH=OFF $(CMAKE_FLAGS)

# The install check is a packaging test; it says nothing more under the sanitizers. The leak
# suppressions reach every program the tests start, the tool's pictures included.
test-sanitize: deps $(ASAN_BUILD)/build.ninja
	cmake --build $(ASAN_BUILD) -j $(JOBS)
	ASAN_OPTIONS=detect_leaks=1:abort_on_error=1 UBSAN_OPTIONS=print_stacktrace=1:halt_on_error=1 \
	  LSAN_OPTIONS=suppressions=$(CURDIR)/scripts/lsan.supp \
	  ctest --test-dir $(ASAN_BUILD) --output-on-failure -j $(JOBS) -LE install

TSAN_FLAGS := -fsanitize=thread -fno-omit-frame-pointer
$(TSAN_BUILD)/build.ninja:
	cmake -S . -B $(TSAN_BUILD) -G Ninja -DCMAKE_BUILD_TYPE=RelWithDebInfo -DPLOTAID_BUILD_BENCH=OFF \
	  -DCMAKE_CXX_FLAGS="$(TSAN_FLAGS)" -DCMAKE_C_FLAGS="$(TSAN_FLAGS)" \
	  -DCMAKE_EXE_LINKER_FLAGS=-fsanitize=thread -DCMAKE_SHARED_LINKER_FLAGS=-fsanitize=thread $(CMAKE_FLAGS)

# Only the threaded cases, and only the program that holds them.
test-tsan: deps $(TSAN_BUILD)/build.ninja
	cmake --build $(TSAN_BUILD) -j $(JOBS) --target test_foundation
	TSAN_OPTIONS=halt_on_error=1:second_deadlock_stack=1 \
	  ctest --test-dir $(TSAN_BUILD) --output-on-failure -L threaded

demo: build
	@scripts/demo $(BUILD)/bin/plotaid

# Every sample chart before and after each designer template, as PNG files in docs/gallery/.
gallery: build
	@scripts/gallery $(BUILD)/bin/plotaid

$(BENCH_BUILD)/build.ninja:
	cmake -S . -B $(BENCH_BUILD) -G Ninja -DCMAKE_BUILD_TYPE=Release -DPLOTAID_BUILD_TESTS=OFF -DPLOTAID_BUILD_BENCH=ON $(CMAKE_FLAGS)

bench: deps $(BENCH_BUILD)/build.ninja
	cmake --build $(BENCH_BUILD) -j $(JOBS)
	@for b in $(BENCH_BUILD)/bench/bench_*; do [ -x "$$b" ] && "$$b" || exit 1; done

$(FUZZ_BUILD)/build.ninja:
	CC=clang CXX=clang++ cmake -S . -B $(FUZZ_BUILD) -G Ninja -DCMAKE_BUILD_TYPE=RelWithDebInfo \
	  -DPLOTAID_BUILD_TESTS=OFF -DPLOTAID_BUILD_BENCH=OFF -DPLOTAID_BUILD_FUZZ=ON $(CMAKE_FLAGS)

fuzz: deps $(FUZZ_BUILD)/build.ninja
	cmake --build $(FUZZ_BUILD) -j $(JOBS)

# Each fuzz target runs for FUZZ_SECONDS from its seed corpus; a crash fails the run.
fuzz-smoke: fuzz
	@scripts/fuzz-smoke $(FUZZ_BUILD) $(FUZZ_SECONDS)

format:
	@git ls-files '*.cpp' '*.h' | xargs clang-format -i

clean:
	rm -rf $(BUILD) $(ASAN_BUILD) $(TSAN_BUILD) $(BENCH_BUILD) $(FUZZ_BUILD)
