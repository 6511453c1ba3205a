# Every target bootstraps the machine first, so each is one command on a fresh Debian machine.
.PHONY: bootstrap demo test dev bench fuzz memory soak format clean

bootstrap:
	@scripts/bootstrap

demo: bootstrap
	cmake --preset release
	cmake --build --preset release
	scripts/run-demo build/release

test: bootstrap
	cmake --preset asan
	cmake --build --preset asan
	ctest --preset asan

dev: bootstrap
	cmake --preset dev
	cmake --build --preset dev

bench: bootstrap
	cmake --preset release -DEC_BUILD_BENCH=ON
	cmake --build --preset release
	for b in build/release/Bench/*Bench; do $$b; done

# Fuzzes each parser for FUZZ_SECONDS (default 10 minutes each); crashes land in Fuzz/corpus.
FUZZ_SECONDS ?= 600
fuzz: bootstrap
	@scripts/bootstrap fuzz
	cmake --preset fuzz
	cmake --build --preset fuzz
	scripts/fuzz build/fuzz $(FUZZ_SECONDS)

# Long use of the demo in a release build must keep the program's memory flat.
memory: bootstrap
	cmake --preset release
	cmake --build --preset release
	scripts/memory-check build/release/Apps/effectcontrols/effectcontrols

# A long random session under the sanitizers (MONKEY_EVENTS events from MONKEY_SEED); a failure is
# cut down to the shortest prefix that shows it.
MONKEY_EVENTS ?= 100000
MONKEY_SEED ?= 20261207
soak: bootstrap
	cmake --preset asan
	cmake --build --preset asan --target effectcontrols
	scripts/monkey build/asan/Apps/effectcontrols/effectcontrols $(MONKEY_EVENTS) $(MONKEY_SEED)

format:
	git ls-files '*.h' '*.cpp' | xargs clang-format -i

clean:
	rm -rf build
