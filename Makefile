# The commands a person types. Each installs what a fresh machine lacks first.
.PHONY: demo test fuzz bench test-build release deps clean

deps:
	@bash scripts/install-deps

# The host in release, then the demo on a copy of the examples: modules, sources and
# pictures under build/demo.
demo: deps
	cmake --preset release
	cmake --build --preset release --target formkit
	bash scripts/demo

# clang under AddressSanitizer, UndefinedBehaviorSanitizer and LeakSanitizer, with the fuzz targets.
test-build: deps
	cmake --preset test
	cmake --build --preset test

# g++ -O2: the libraries, their tests and the benchmarks.
release: deps
	cmake --preset release
	cmake --build --preset release

# Both compilers, because each finds faults the other misses: the sanitizer build's tests and
# bounded fuzz runs first, then the g++ build's tests, whose CTest summary ends the output.
test: test-build
	ctest --preset test
	cmake --preset release
	cmake --build --preset release
	bash scripts/check-consumer
	ctest --preset release

fuzz: test-build
	bash scripts/fuzz-campaign

# Every benchmark, ending with one table: operation, size, formkit, baseline, ratio.
bench: release
	@bash scripts/bench-table

clean:
	rm -rf build
