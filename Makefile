# What people type. CMake does the work: see CMakePresets.json for what is built, and where.

.DEFAULT_GOAL := demo
.PHONY: demo test deps deps-test

# Replays a day's commute through three clients of the activity sensor, in the 32-bit build where the host has one.
demo: deps
	@set -e; preset=$$(scripts/host-presets.sh x86 native | awk '{ print $$1 }'); \
	cmake --preset $$preset -DBUILD_TESTING=OFF >build/$$preset.log 2>&1 || { cat build/$$preset.log; exit 1; }; \
	cmake --build --preset $$preset >build/$$preset.log 2>&1 || { cat build/$$preset.log; exit 1; }; \
	build/$$preset/bin/senseloom replay examples/commute.jsonl

# Builds and tests everything: both word sizes, optimised and under sanitizers.
test: deps-test
	@set -e; for preset in $$(scripts/host-presets.sh x86 native asan-x86 asan-native); do \
	  echo "== $$preset"; \
	  cmake --preset $$preset -DBUILD_TESTING=ON >build/$$preset.log 2>&1 || { cat build/$$preset.log; exit 1; }; \
	  cmake --build --preset $$preset >build/$$preset.log 2>&1 || { cat build/$$preset.log; exit 1; }; \
	  ctest --preset $$preset --progress; \
	done

deps:
	@mkdir -p build
	@scripts/install-deps.sh build

deps-test:
	@mkdir -p build
	@scripts/install-deps.sh build test
