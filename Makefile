# The commands a person types. Each installs what a fresh machine lacks first.
.PHONY: test bench release deps clean

deps:
	@bash scripts/install-deps

test: deps
	cmake --preset test
	cmake --build --preset test
	ctest --preset test

release: deps
	cmake --preset release
	cmake --build --preset release

bench: release
	@for b in build/release/bench/*/fk_bench_*; do echo "== $$b"; $$b --benchmark_min_time=0.2; done

clean:
	rm -rf build
