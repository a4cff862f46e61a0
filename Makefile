# Set-up, build and test entry points (see README.md, "Build and set-up").
#
#   make deps    install the Debian packages the build needs (root or sudo),
#                qemu-user too where 32-bit x86 programs do not run natively
#   make build   configure and build the native preset (build/native)
#   make demo    deps, build dpx-decode and the module only, then decode the
#                bundled sample messages: a call flow's summary, one Initial
#                DP in the readable view, statistics over every sample
#   make install build and install dpx-decode, the module and the host
#                libraries under PREFIX (default /usr/local)
#   make test    deps, then build and test the native, asan and m32 presets,
#                then build the fuzz preset and run each fuzz target briefly
#                over its seeds (test-fuzz)
#   make bench   build, then run the benchmarks
#   make bench-capture   build, then dpx-decode against tshark on a capture
#   make mutation  plant the faults of tools/mutation/faults.py one at a
#                time in a copy of the tree (build/mutation), rebuild, run
#                the native tests, report which faults the tests catch
#   make clean   remove build/

SHELL := /bin/bash
.DEFAULT_GOAL := build

PRESETS := native asan m32
# clang and its libFuzzer runtime serve the fuzz preset only (make fuzz,
# make fuzz-capture and the fuzz smoke run of make test).
FUZZ_PACKAGES := clang libclang-rt-14-dev
DEB_PACKAGES := cmake ninja-build g++ g++-multilib googletest libgtest-dev \
                libbenchmark-dev nlohmann-json3-dev libcli11-dev zlib1g-dev libzstd-dev liblz4-dev tshark \
                python3 $(FUZZ_PACKAGES)
SUDO := $(shell [ "$$(id -u)" = 0 ] || echo sudo)
APT_INSTALL := $(SUDO) apt-get update -qq; \
               $(SUDO) env DEBIAN_FRONTEND=noninteractive apt-get install -y -qq --no-install-recommends

# How the m32 programs run: natively where the kernel executes 32-bit x86
# programs, else under qemu-i386 (Debian qemu-user).  DPX_M32_EMULATOR=PROG
# (environment or make command line) runs them under PROG on any machine.
DPX_M32_EMULATOR ?=
M32_RUNNER := sh cmake/m32-runner.sh "$(DPX_M32_EMULATOR)"
# Shell: sets $$m32 (how they run), or says in one line why they cannot run.
M32_CHECK := m32=$$($(M32_RUNNER) 2>&1) || { echo "make test: $$m32" >&2; exit 1; }; \
             [ "$$m32" = native ] && m32=natively || m32="under $$m32"

SAMPLES := $(sort $(wildcard samples/*.txt))
# A call flow over Ethernet/IPv4/SCTP/M3UA/SCCP (samples/callflow.hex).
DEMO_CAPTURE := samples/callflow-m3ua.pcap
DECODE := build/native/dpx-decode
PREFIX ?= /usr/local

.PHONY: deps build demo install test test-fuzz bench clean mutation $(addprefix test-,$(PRESETS))

deps:
	@missing=""; \
	for pkg in $(DEB_PACKAGES); do \
	    dpkg -s "$$pkg" 2>/dev/null | grep -q '^Status: install ok installed' \
	        || missing="$$missing $$pkg"; \
	done; \
	if [ -n "$$missing" ]; then \
	    echo "make deps: installing$$missing"; \
	    echo "wireshark-common wireshark-common/install-setuid boolean false" \
	        | $(SUDO) debconf-set-selections; \
	    $(APT_INSTALL) $$missing; \
	fi
	@# Headless Chromium renders the call-flow picture in a test; a machine
	@# that cannot install it skips that test.
	@dpkg -s chromium 2>/dev/null | grep -q '^Status: install ok installed' \
	    || { echo "make deps: installing chromium"; $(APT_INSTALL) chromium \
	         || echo "make deps: chromium not installed: flow_render will be skipped"; }
	@# Only now can gcc -m32 link (g++-multilib); exit status 2: built, not run.
	@$(M32_RUNNER) >/dev/null 2>&1; \
	if [ $$? = 2 ] && ! command -v qemu-i386 >/dev/null \
	    && case "$(DPX_M32_EMULATOR)" in ""|qemu-i386) true ;; *) false ;; esac; then \
	    echo "make deps: no 32-bit x86 execution here: installing qemu-user"; \
	    $(APT_INSTALL) qemu-user; \
	fi

build:
	cmake --preset native
	cmake --build --preset native

# Only what the demonstration runs is built (no tests, no benchmarks).
demo: deps
	@test -n "$(SAMPLES)" -a -f $(DEMO_CAPTURE) \
	    || { echo "make demo: the sample messages are missing from samples/" >&2; exit 1; }
	cmake --preset native >/dev/null
	cmake --build --preset native --target dpx-decode
	@echo; echo "== A call flow, one line a message: $(DECODE) --summary $(DEMO_CAPTURE)"
	@$(DECODE) --summary $(DEMO_CAPTURE) | head -n 18
	@echo "   ..."
	@echo; echo "== One Initial DP, readable: $(DECODE) --hex HEX (--fields all: every field)"
	@$(DECODE) --hex $$(grep -A1 -m1 'Begin: InitialDP' samples/callflow.hex | tail -n 1)
	@echo "== Statistics over every bundled sample: $(DECODE) --stats --pass none samples/*.txt $(DEMO_CAPTURE)"
	@$(DECODE) --stats --pass none $(SAMPLES) $(DEMO_CAPTURE) | grep -v '^service key\|^cause\|^event'
	@echo "   ... (service keys, causes and events left out here)"

# Builds what is installed only: dpx-decode, the module and the host libraries.
install:
	cmake --preset native >/dev/null
	cmake --build --preset native --target dpx-decode
	cmake --install build/native --prefix "$(PREFIX)"

# Each preset is configured, built and tested in turn; the first failure stops.
test: deps
	@for preset in $(PRESETS); do \
	    echo "==== $$preset ===="; \
	    if [ "$$preset" = m32 ]; then $(M32_CHECK); fi; \
	    cmake --preset "$$preset" \
	        && cmake --build --preset "$$preset" \
	        && ctest --preset "$$preset" \
	        || { echo "make test: $$preset FAILED" >&2; exit 1; }; \
	done; \
	$(MAKE) --no-print-directory test-fuzz || { echo "make test: fuzz FAILED" >&2; exit 1; }; \
	echo "make test: $(PRESETS) and fuzz passed$${m32:+ (m32 programs run $$m32)}"

$(addprefix test-,$(PRESETS)): test-%:
	@if [ $* = m32 ]; then $(M32_CHECK); echo "m32 programs run $$m32"; fi
	cmake --preset $*
	cmake --build --preset $*
	ctest --preset $*

bench: build
	@test -x build/native/camel_bench \
	    || { echo "make bench: camel_bench not built (bench/ or Google Benchmark missing)" >&2; exit 1; }
	build/native/camel_bench

# dpx-decode against tshark on one capture of BENCH_MESSAGES CAMEL messages
# (bench/capture_bench.py; needs tshark and ../shared/tools).
BENCH_MESSAGES ?= 100000
.PHONY: bench-capture
bench-capture: build
	python3 bench/capture_bench.py --messages $(BENCH_MESSAGES)

# Not part of make test: one incremental build and test run per fault.
# MUTATION_ARGS: e.g. --resume, --only ID,ID.
MUTATION_ARGS ?=
mutation:
	python3 tools/mutation/mutate.py --out build/mutation/table.md $(MUTATION_ARGS)

clean:
	rm -rf build

# ---- fuzzing -------------------------------------------------------------------
# make fuzz: the fuzz preset (build/fuzz: clang, libFuzzer, ASan+UBSan), then
# camel_fuzz for FUZZ_TIME seconds over build/fuzz/corpus (new inputs),
# build/fuzz/seeds (samples/*.txt) and fuzz/corpus.  Crash inputs land in
# build/fuzz/.
FUZZ_TIME ?= 300
FUZZ_ARGS ?= -max_len=512 -dict=fuzz/camel.dict
# make test-fuzz (part of make test): each target for FUZZ_SMOKE_TIME seconds,
# its seeds first, new inputs kept in a scratch directory only.
FUZZ_SMOKE_TIME ?= 15

.PHONY: fuzz fuzz-capture fuzz-capture-file fuzz-ip-fragments fuzz-tools
fuzz: fuzz-tools
	build/fuzz/camel_fuzz -max_total_time=$(FUZZ_TIME) -artifact_prefix=build/fuzz/ \
	    $(FUZZ_ARGS) build/fuzz/corpus build/fuzz/seeds fuzz/corpus

# make fuzz-capture: capture_fuzz, dpx-decode's frame walker (link layer to
# TCAP message), over build/fuzz/capture-corpus and seeds from samples/*.pcap.
fuzz-capture: fuzz-tools
	build/fuzz/capture_fuzz -max_total_time=$(FUZZ_TIME) -artifact_prefix=build/fuzz/ \
	    -max_len=4096 build/fuzz/capture-corpus build/fuzz/capture-seeds

# make fuzz-capture-file: capture_file_fuzz, the capture reader and the
# decompressors, seeded with the sample captures as they are.
fuzz-capture-file: fuzz-tools
	mkdir -p build/fuzz/capture-file-corpus
	build/fuzz/capture_file_fuzz -max_total_time=$(FUZZ_TIME) -artifact_prefix=build/fuzz/ \
	    -max_len=16384 build/fuzz/capture-file-corpus samples

# make fuzz-ip-fragments: ip_fragments_fuzz, IP reassembly.
fuzz-ip-fragments: fuzz-tools
	mkdir -p build/fuzz/ip-fragments-corpus
	build/fuzz/ip_fragments_fuzz -max_total_time=$(FUZZ_TIME) -artifact_prefix=build/fuzz/ \
	    -max_len=4096 build/fuzz/ip-fragments-corpus

test-fuzz: fuzz-tools
	rm -rf build/fuzz/smoke && mkdir -p build/fuzz/smoke/camel build/fuzz/smoke/capture \
	    build/fuzz/smoke/capture-file build/fuzz/smoke/ip-fragments
	build/fuzz/camel_fuzz -max_total_time=$(FUZZ_SMOKE_TIME) -artifact_prefix=build/fuzz/ \
	    -print_final_stats=1 $(FUZZ_ARGS) build/fuzz/smoke/camel build/fuzz/seeds fuzz/corpus
	build/fuzz/capture_fuzz -max_total_time=$(FUZZ_SMOKE_TIME) -artifact_prefix=build/fuzz/ \
	    -print_final_stats=1 -max_len=4096 build/fuzz/smoke/capture build/fuzz/capture-seeds
	build/fuzz/capture_file_fuzz -max_total_time=$(FUZZ_SMOKE_TIME) -artifact_prefix=build/fuzz/ \
	    -print_final_stats=1 -max_len=16384 build/fuzz/smoke/capture-file samples
	build/fuzz/ip_fragments_fuzz -max_total_time=$(FUZZ_SMOKE_TIME) -artifact_prefix=build/fuzz/ \
	    -print_final_stats=1 -max_len=4096 build/fuzz/smoke/ip-fragments

fuzz-tools: deps
	cmake --preset fuzz
	cmake --build --preset fuzz -j2
	mkdir -p build/fuzz/corpus build/fuzz/capture-corpus
