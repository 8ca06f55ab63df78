# The commands of the house. Each brings what it needs by itself; scripts/setup is quick when nothing is missing.

SHELL := /bin/bash
.DEFAULT_GOAL := help

# One checkout's compilations serve another's: the compiler cache looks at paths from the checkout on.
export CCACHE_BASEDIR := $(CURDIR)
export CCACHE_NOHASHDIR := 1

.PHONY: help setup demo demo-windows demo-windows-line release pictures test test-hosted test-asan test-tsan test-windows bench prove fuzz format lint lint-changed tidy clean

help:
	@echo "make demo                install the sample suite on a fresh machine and show what came of it"
	@echo "make demo-windows        the same with the wizard under Wine"
	@echo "make demo-windows-line   the same with hvdeploy.exe under Wine"
	@echo "make release             the folder that ships and its archive, in dist"
	@echo "make release SUITE=DIR   the same of your own packages; see docs/releasing.md"
	@echo "make pictures            the wizard's pictures in docs/images, taken again"
	@echo "make test                every test on both targets"
	@echo "make test-hosted         the tests of one target; also: test-windows"
	@echo "make test-asan           the hosted tests under sanitizers; also: test-tsan"
	@echo "make bench               speed and memory, against standard tools"
	@echo "make prove               the sample as an upgrade, broken in every way, and what became of the machine"
	@echo "make fuzz                bytes that crash, stall or bloat a reader; FUZZ_SECONDS=30"
	@echo "make format              apply .clang-format"
	@echo "make lint                form, spelling, house rules and clang-tidy of all that ships"
	@echo "make lint-changed        the same, with clang-tidy of what differs from the last commit alone"
	@echo "make tidy                clang-tidy with its analyzer, of the tests too"
	@echo "make setup               install what is missing, and nothing else"
	@echo "make clean               remove build and dist"

setup:
	@scripts/setup

demo: setup
	@scripts/demo hosted

demo-windows: setup
	@scripts/demo wizard

demo-windows-line: setup
	@scripts/demo windows

# A relative SUITE counts from the folder of whoever calls, which with `make -C` is another than this one.
CALLER := $(or $(PWD),$(CURDIR))
SUITE_FOLDER = $(if $(filter /%,$(firstword $(SUITE))),$(SUITE),$(CALLER)/$(SUITE))

# Another suite has a build of its own: the tests look at the sample.
RELEASE_BUILD := build/$(if $(SUITE),suite,windows)

release: setup
	@echo "== Building the programs of the release in $(RELEASE_BUILD)"
	@cmake --preset windows -B $(RELEASE_BUILD) $(if $(SUITE),-D "HV_SUITE=$(SUITE_FOLDER)") >/dev/null
	@cmake --build $(RELEASE_BUILD) --target hvinstaller hvdeploy
	@scripts/make-release dist $(RELEASE_BUILD)

pictures: setup
	@scripts/take-pictures

test: test-hosted test-windows

# The Windows tests compare what both targets leave behind, so they need the hosted programs too.
test-windows: build-hosted

test-hosted: test-on-hosted
test-asan: test-on-hosted-asan
test-tsan: test-on-hosted-tsan
test-windows: test-on-windows

PRESETS := hosted hosted-asan hosted-tsan windows
.PHONY: $(PRESETS:%=build-%) $(PRESETS:%=test-on-%)

$(PRESETS:%=build-%): build-%: setup
	@echo "== Building the preset $*"
	@cmake --preset $* >/dev/null
	@cmake --build --preset $*
	@ln -sf build/hosted/compile_commands.json .

$(PRESETS:%=test-on-%): test-on-%: build-%
	@echo "== Testing the preset $*"
	@ctest --preset $*

bench: build-hosted
	@bench/run

prove: build-hosted
	@build/hosted/bin/prove build/hosted/bin/hvdeploy build/hosted/bin/packages samples/machines/everything.reg

fuzz: setup
	@echo "== Building the preset fuzz"
	@cmake --preset fuzz >/dev/null
	@cmake --build --preset fuzz
	@scripts/fuzz

format: setup
	@git ls-files '*.h' '*.cpp' | xargs clang-format -i

# clang-tidy reads the headers and sources that a build makes.
lint: build-hosted build-windows
	@scripts/lint

lint-changed: setup
	@cmake --preset hosted >/dev/null && cmake --preset windows >/dev/null
	@scripts/lint --changed

tidy: build-hosted build-windows
	@scripts/tidy --deep

clean:
	@rm -rf build dist
