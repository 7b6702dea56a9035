# The two commands: `make demo` and `make check`. Both install what is
# missing (as root), configure and build under build/.
BUILD ?= build
PY2 ?= /usr/bin/python2.7
CMAKE_FLAGS ?=
JOBS ?= $(shell nproc)
MAKEFLAGS += --no-print-directory

.PHONY: deps configure build demo check bench clean sanitize refcheck leakcheck

deps:
	@bash scripts/install-deps.sh

configure: deps
	@cmake -S . -B $(BUILD) -DPYTHON2=$(PY2) $(CMAKE_FLAGS) >/dev/null

build: configure
	@cmake --build $(BUILD) -j$(JOBS)

demo: build
	@PYTHONPATH=$(BUILD)/python $(PY2) examples/demo.py

check: build
	@cd $(BUILD) && ctest --output-on-failure -j$(JOBS)

# Sanitizer build in its own tree: every test, and the hostile-input sweep
# over every function, under AddressSanitizer and UndefinedBehaviorSanitizer.
sanitize:
	@$(MAKE) check BUILD=build-asan CMAKE_FLAGS=-DQORCTL_SANITIZE=ON

# The modules built for the debug interpreter in their own tree: every test
# under python2.7-dbg, each Python test module again with its reference total
# watched, and the sweep with the references of every call checked.
refcheck:
	@$(MAKE) check BUILD=build-dbg PY2=/usr/bin/python2.7-dbg CMAKE_FLAGS=-DQORCTL_PYDEBUG=ON

# Heap leaks: the Python tests and a sample of the sweep under valgrind, on
# the normal build. LEAKCHECK_ARGS go to tests/robust/leakcheck.py.
LEAKCHECK_ARGS ?=
leakcheck: build
	@$(PY2) tests/robust/leakcheck.py --build $(BUILD) --python $(PY2) $(LEAKCHECK_ARGS)

# Benchmarks: configures the same tree with QORCTL_BENCH on and builds only
# the bench targets (they stay out of the default build, so `make check`
# never builds them), then prints the timing table. BENCH_ARGS go to
# bench/run.py, e.g. BENCH_ARGS="--only items --rounds 31".
BENCH_ARGS ?=
bench: deps
	@bash bench/deps.sh
	@cmake -S . -B $(BUILD) -DPYTHON2=$(PY2) -DQORCTL_BENCH=ON $(CMAKE_FLAGS) >/dev/null
	@cmake --build $(BUILD) -j$(JOBS) --target qorctl_bench
	@$(PY2) bench/run.py --build $(BUILD) $(BENCH_ARGS)

clean:
	rm -rf build build-asan build-dbg
