# Set-up and test commands. Each installs the Debian packages it needs when
# they are missing, configures and builds.

PACKAGES := g++ cmake make python3 time libgtest-dev libsimdjson-dev yosys iverilog verilator nextpnr-ice40 fpga-icestorm opensta
JOBS ?= 2
BUILD := build
BUILD_ASAN := build-asan
BUILD_FUZZ := build-fuzz
FUZZ_SECONDS ?= 60

.PHONY: all deps build demo test test-unit bench clean format fuzz

all: build

deps:
	@missing=""; for p in $(PACKAGES); do \
	  dpkg-query -W -f='$${Status}\n' $$p 2>/dev/null | grep -q "install ok installed" || missing="$$missing $$p"; \
	done; \
	if [ -n "$$missing" ]; then \
	  echo "Installing:$$missing"; \
	  SUDO=""; [ "$$(id -u)" = 0 ] || SUDO=sudo; \
	  $$SUDO apt-get update -qq && DEBIAN_FRONTEND=noninteractive $$SUDO apt-get install -y -qq --no-install-recommends $$missing >/dev/null; \
	fi

build: deps
	cmake -S . -B $(BUILD) -DCMAKE_BUILD_TYPE=Release -DNLW_TESTS=OFF >/dev/null
	cmake --build $(BUILD) -j$(JOBS)

demo: build
	@bash examples/demo.sh $(BUILD)

# Unit tests and the end-to-end checks with real tools, built with
# AddressSanitizer and UndefinedBehaviorSanitizer.
test: deps
	cmake -S . -B $(BUILD_ASAN) -DCMAKE_BUILD_TYPE=Debug -DNLW_SANITIZE=ON -DNLW_WERROR=$(if $(CI),ON,OFF) >/dev/null
	cmake --build $(BUILD_ASAN) -j$(JOBS)
	@cd $(BUILD_ASAN) && { ASAN_OPTIONS=detect_leaks=1 UBSAN_OPTIONS=print_stacktrace=1 \
	  ctest --output-on-failure -j$(JOBS); echo $$? > ctest.status; } 2>&1 | tee ctest.log; \
	total=$$(sed -n 's/.* tests failed out of \([0-9]*\).*/\1/p' ctest.log | tail -1); \
	failed=$$(sed -n 's/.*, \([0-9]*\) tests failed out of .*/\1/p' ctest.log | tail -1); \
	echo "$$(( $${total:-0} - $${failed:-0} )) passed, $${failed:-0} failed"; \
	exit $$(cat ctest.status)

# The libFuzzer target over the reader and a whole write into memory, run
# for FUZZ_SECONDS on the example designs; findings in build-fuzz/fuzz-findings.
fuzz: deps
	@$(MAKE) --no-print-directory deps PACKAGES="clang"
	CXX=clang++ cmake -S . -B $(BUILD_FUZZ) -DCMAKE_BUILD_TYPE=RelWithDebInfo -DNLW_FUZZ=ON -DNLW_TESTS=OFF >/dev/null
	cmake --build $(BUILD_FUZZ) -j$(JOBS) --target nlw_fuzz_design
	bash tests/fuzz/run_fuzz.sh $(BUILD_FUZZ) $(FUZZ_SECONDS)

bench: build
	@bash bench/run.sh $(BUILD)
	@bash bench/run_program.sh $(BUILD) --yosys

format:
	clang-format -i host/*/*.h host/*/*.cpp s/*.h s/*.cpp apps/*.cpp apps/common/* tests/unit/*.cpp tests/unit/*/*.cpp 2>/dev/null || true

clean:
	rm -rf $(BUILD) $(BUILD_ASAN) $(BUILD_FUZZ) out
