# The commands a person types. Each installs what a fresh machine lacks first.
.PHONY: demo studio test fuzz bench test-build release threads deps clean

deps:
	@bash scripts/install-deps

# The host in release, then the demo on a copy of the examples: modules, sources and
# pictures under build/demo.
demo: deps
	cmake --preset release
	cmake --build --preset release --target formkit
	bash scripts/demo

# The studio in the browser on a copy of the examples (build/studio-demo), at
# http://127.0.0.1:8080/ until interrupted.
studio: deps
	cmake --preset release
	cmake --build --preset release --target formkit
	rm -rf build/studio-demo && mkdir -p build/studio-demo
	cp examples/*.kfm examples/*.fks build/studio-demo/
	build/release/host/formkit studio build/studio-demo --port 8080

# clang under AddressSanitizer, UndefinedBehaviorSanitizer and LeakSanitizer, with the fuzz targets.
test-build: deps
	cmake --preset test
	cmake --build --preset test

# g++ -O2: the libraries, their tests and the benchmarks.
release: deps
	cmake --preset release
	cmake --build --preset release

# The process runner's threads under ThreadSanitizer, in a build of their own: the address
# sanitizer of the test build cannot run beside it.
threads: deps
	cmake --preset threads
	cmake --build --preset threads
	TSAN_OPTIONS=halt_on_error=1 build/threads/tests/tools/fk_test_tools --gtest_brief=1 \
	  --gtest_filter='*Process*:*Thread*'

# Both compilers, because each finds faults the other misses: the sanitizer build's tests and
# bounded fuzz runs first, the runner's threads, the installed package, the studio in headless
# Chromium, then the g++ build's tests, whose CTest summary ends the output.
test: test-build
	ctest --preset test
	$(MAKE) --no-print-directory threads
	cmake --preset release
	cmake --build --preset release
	bash scripts/check-consumer
	FORMKIT=build/release/host/formkit bash scripts/studio-e2e
	ctest --preset release

fuzz: test-build
	bash scripts/fuzz-campaign

# Every benchmark, ending with one table: operation, size, formkit, baseline, ratio.
bench: release
	@bash scripts/bench-table

clean:
	rm -rf build
