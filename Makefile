# What people type. CMake does the work: see CMakePresets.json for what is built, and where.
SHELL := /bin/bash

.DEFAULT_GOAL := demo
.PHONY: demo test sanitize install packages check-packages release accuracy bench bench-count fuzz coverage memcheck mutants lint
.SILENT:

# $(call build,PRESET,CMAKE ARGUMENTS,TARGET): quietly but for where it is done, unless it fails.
build = echo "Building in build/$(1), which can take some minutes; build/$(1).log shows how far it is." >&2; { cmake --preset $(1) $(2) && cmake --build --preset $(1) $(3:%=--target %); } >build/$(1).log 2>&1 || { cat build/$(1).log; exit 1; }

# $(call install,TASKS)
install = mkdir -p build && scripts/install-deps.sh $(1)

# Runs a recording of a person who sits, walks and climbs stairs through the sensor hub, the library and three clients, in the
# 32-bit build where the host has one.
demo:
	$(call install,build)
	read -r preset _ <<<"$$(scripts/host-presets.sh x86 native)"; \
	$(call build,$$preset,-DBUILD_TESTING=OFF); \
	scripts/demo.sh build/$$preset/bin/senseloom

# $(call run_tests,PRESETS)
define run_tests
	$(call install,build test)
	for preset in $$(scripts/host-presets.sh $(1)); do \
	  echo "== $$preset"; \
	  $(call build,$$preset,-DBUILD_TESTING=ON); \
	  ctest --preset $$preset || exit 1; \
	done
endef

# Builds and tests everything, in both word sizes.
test:
	$(call run_tests,x86 native)

# The same under sanitizers.
sanitize:
	$(call run_tests,asan-x86 asan-native)

# Installs the library in the host's word size, the tool and the documentation below PREFIX. BUILD is the folder to build
# them in.
PREFIX := /usr/local
BUILD := build/install
install:
	$(call install,build)
	echo "Building in $(BUILD), which can take some minutes."
	[ -e $(BUILD)/build.ninja ] || cmake -G Ninja -B $(BUILD) -D BUILD_TESTING=OFF >/dev/null
	cmake --build $(BUILD) && cmake --install $(BUILD) --prefix $(PREFIX)

# Makes the Debian packages, of the library in both word sizes, and checks them by lintian.
packages:
	$(call install,build packages)
	rm -rf build/packages
	for preset in $$(scripts/host-presets.sh x86 native); do \
	  $(call build,$$preset,-DBUILD_TESTING=OFF); \
	  packaging/make_debs.py build/$$preset build/packages || exit 1; \
	done
	lintian --allow-root --fail-on error,warning build/packages/*.deb
	ls build/packages/*.deb

# Installs the packages into a new Debian system in a folder, and uses them there. Takes root and some minutes.
check-packages: packages
	packaging/check_in_chroot.sh build/packages

# Makes a release of the version in include/senseloom.h: tested packages, notes and a tag. CONTRIBUTING.md says more.
release:
	scripts/release.sh $(MAKE)

# Prints how well is sensed and recognised what was not learned from; of the recordings in DATA, a folder laid out as data/.
DATA := data
accuracy:
	$(call install,build test)
	read -r preset _ <<<"$$(scripts/host-presets.sh x86 native)"; \
	$(call build,$$preset,-DBUILD_TESTING=ON,accuracy_recognise accuracy_sensing) && \
	tests/accuracy/accuracy.py build/$$preset $(DATA)

# Times the library beside what one would write instead, and prints ratios.
bench:
	$(call install,build test bench)
	programs=; for preset in $$(scripts/host-presets.sh x86 native); do \
	  $(call build,$$preset,-DBUILD_TESTING=ON -DSENSELOOM_BENCH=ON); \
	  programs="$$programs build/$$preset/bin/bench_contests"; \
	done; bench/report $$programs

# Counts instructions and heap calls a record, beside their bounds.
bench-count:
	$(call install,build test)
	for preset in $$(scripts/host-presets.sh x86 native); do \
	  $(call build,$$preset,-DBUILD_TESTING=ON); \
	  bench/count/count build/$$preset/bin/bench_scenarios || exit 1; \
	done

# Lets each fuzzer run for FUZZ_SECONDS, in both word sizes.
FUZZ_SECONDS := 60
fuzz:
	$(call install,build test fuzz)
	for preset in $$(scripts/host-presets.sh fuzz-x86 fuzz-native); do \
	  $(call build,$$preset,-DBUILD_TESTING=ON,fuzzers); \
	  fuzz/run.sh $(FUZZ_SECONDS) build/$$preset || exit 1; \
	done

# Fails unless the tests run all of the library's code, every condition both ways.
coverage:
	$(call install,build test coverage)
	for preset in $$(scripts/host-presets.sh coverage-x86); do \
	  $(call build,$$preset,-DBUILD_TESTING=ON); \
	  scripts/coverage.py build/$$preset || exit 1; \
	done

# Runs the tests under valgrind, in a build by the other compiler.
memcheck:
	$(call install,build test)
	$(call build,memcheck,-DBUILD_TESTING=ON)
	ctest --preset memcheck

# Changes the library in one place at a time, and fails when too many of the changes go unnoticed by the tests.
mutants:
	$(call install,build test)
	scripts/mutants.py

lint:
	$(call install,build test lint)
	$(call build,lint,-DBUILD_TESTING=ON)
	scripts/lint.sh build/lint
