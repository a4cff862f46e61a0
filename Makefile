# Set-up, build and test entry points (see README.md, "Build and set-up").
#
#   make deps    install the Debian packages the build needs (root or sudo)
#   make build   configure and build the native preset (build/native)
#   make demo    deps + build, then decode the bundled sample messages and a
#                sample capture
#   make test    deps, then build and test the native, asan and m32 presets
#   make bench   build, then run the benchmarks
#   make bench-capture   build, then dpx-decode against tshark on a capture
#   make clean   remove build/

SHELL := /bin/bash
.DEFAULT_GOAL := build

PRESETS := native asan m32
DEB_PACKAGES := cmake ninja-build g++ g++-multilib googletest libgtest-dev \
                libbenchmark-dev nlohmann-json3-dev libcli11-dev libpcap-dev tshark \
                python3
SUDO := $(shell [ "$$(id -u)" = 0 ] || echo sudo)

SAMPLES := $(sort $(wildcard samples/*.txt))
# A call flow over Ethernet/IPv4/SCTP/M3UA/SCCP (samples/callflow.hex).
DEMO_CAPTURES := samples/callflow-m3ua.pcap
DEMO_ARGS ?= $(SAMPLES) $(DEMO_CAPTURES)

.PHONY: deps build demo test bench clean $(addprefix test-,$(PRESETS))

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
	    $(SUDO) apt-get update -qq; \
	    $(SUDO) env DEBIAN_FRONTEND=noninteractive \
	        apt-get install -y -qq --no-install-recommends $$missing; \
	fi

build:
	cmake --preset native
	cmake --build --preset native

demo: deps build
	@if [ -z "$(strip $(DEMO_ARGS))" ]; then \
	    echo "make demo: no sample messages in samples/" >&2; exit 1; \
	fi
	build/native/dpx-decode $(DEMO_ARGS)

# Each preset is configured, built and tested in turn; the first failure stops.
test: deps
	@for preset in $(PRESETS); do \
	    echo "==== $$preset ===="; \
	    cmake --preset "$$preset" \
	        && cmake --build --preset "$$preset" \
	        && ctest --preset "$$preset" \
	        || { echo "make test: $$preset FAILED" >&2; exit 1; }; \
	done; \
	echo "make test: $(PRESETS) passed"

$(addprefix test-,$(PRESETS)): test-%:
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

clean:
	rm -rf build

# ---- fuzzing -------------------------------------------------------------------
# make fuzz: the project's packages plus clang and libFuzzer (FUZZ_PACKAGES,
# installed here only), then the fuzz preset (build/fuzz) and camel_fuzz for
# FUZZ_TIME seconds over build/fuzz/corpus (new inputs), build/fuzz/seeds
# (samples/*.txt) and fuzz/corpus.  Crash inputs land in build/fuzz/.
FUZZ_PACKAGES := clang libclang-rt-14-dev
FUZZ_TIME ?= 300
FUZZ_ARGS ?= -max_len=512 -dict=fuzz/camel.dict

.PHONY: fuzz fuzz-capture fuzz-tools
fuzz: fuzz-tools
	build/fuzz/camel_fuzz -max_total_time=$(FUZZ_TIME) -artifact_prefix=build/fuzz/ \
	    $(FUZZ_ARGS) build/fuzz/corpus build/fuzz/seeds fuzz/corpus

# make fuzz-capture: capture_fuzz, dpx-decode's frame walker (link layer to
# TCAP message), over build/fuzz/capture-corpus and seeds from samples/*.pcap.
fuzz-capture: fuzz-tools
	mkdir -p build/fuzz/capture-corpus
	build/fuzz/capture_fuzz -max_total_time=$(FUZZ_TIME) -artifact_prefix=build/fuzz/ \
	    -max_len=4096 build/fuzz/capture-corpus build/fuzz/capture-seeds

fuzz-tools: deps
	@missing=""; \
	for pkg in $(FUZZ_PACKAGES); do \
	    dpkg -s "$$pkg" 2>/dev/null | grep -q '^Status: install ok installed' \
	        || missing="$$missing $$pkg"; \
	done; \
	if [ -n "$$missing" ]; then \
	    echo "make fuzz: installing$$missing"; \
	    $(SUDO) apt-get update -qq; \
	    $(SUDO) env DEBIAN_FRONTEND=noninteractive \
	        apt-get install -y -qq --no-install-recommends $$missing; \
	fi
	cmake --preset fuzz
	cmake --build --preset fuzz -j2
	mkdir -p build/fuzz/corpus
