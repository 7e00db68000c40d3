# make demo    set up, build, resolve the examples
# make test    set up, build, pass all tests
# make bench   set up, build, measure; make bench ROWS="1 3" QUICK=1
BUILD ?= build
JOBS ?= $(shell nproc)
SECONDS ?= 60

BUILD_PACKAGES = g++ cmake make
TEST_PACKAGES = $(BUILD_PACKAGES) libgtest-dev man-db pkgconf
DEMO_PACKAGES = $(BUILD_PACKAGES) yosys
FUZZ_PACKAGES = $(TEST_PACKAGES) clang-14 libclang-rt-14-dev
PACKAGE_PACKAGES = $(BUILD_PACKAGES) dpkg-dev file
BENCH_PACKAGES = $(BUILD_PACKAGES) ninja-build python3 strace valgrind
COOKBOOK_PACKAGES = $(BUILD_PACKAGES) python3 yosys nextpnr-ice40 fpga-icestorm lepton-eda \
  berkeley-abc m4 zip unzip
CLUSTER_PACKAGES = $(BUILD_PACKAGES) python3 slurm-wlm munge parallel
COMPARE_PACKAGES = $(BUILD_PACKAGES) python3 ninja-build
LINT_PACKAGES = clang-format-14 clang-tidy-14

.PHONY: all build demo cookbook cluster compare test bench sanitize fuzz lint package clean help

all: build

build:
	@tools/setup $(BUILD_PACKAGES)
	@cmake -S . -B $(BUILD) -DCMAKE_BUILD_TYPE=Release -DKESTREL_TESTS=OFF >/dev/null
	@cmake --build $(BUILD) --parallel $(JOBS)
	@echo "Built $(BUILD)/bin/kestrel-launch"

demo:
	@tools/setup $(DEMO_PACKAGES)
	@$(MAKE) --no-print-directory build >/dev/null
	@tools/demo $(BUILD)

# Runs the recipes of the cookbook, with the programs they are about.
cookbook:
	@tools/setup $(COOKBOOK_PACKAGES)
	@$(MAKE) --no-print-directory build >/dev/null
	@tools/cookbook $(BUILD) docs/cookbook.md

# Runs the guide for clusters, with a Slurm on this machine.
cluster:
	@tools/setup $(CLUSTER_PACKAGES)
	@$(MAKE) --no-print-directory build >/dev/null
	@tools/with-slurm sh -c 'echo "export SLURM_CONF=$$SLURM_CONF" >$(BUILD)/slurm.env && \
	  tools/cookbook $(BUILD) docs/cluster.md --setup $(BUILD)/slurm.env'

# Gives the launcher, make and ninja the same tasks: makes the table of docs/why-not-make.md.
compare:
	@tools/setup $(COMPARE_PACKAGES)
	@$(MAKE) --no-print-directory build >/dev/null
	@tools/compare $(BUILD) docs/why-not-make.md

test:
	@tools/setup $(TEST_PACKAGES)
	@cmake -S . -B $(BUILD) -DCMAKE_BUILD_TYPE=Release -DKESTREL_TESTS=ON >/dev/null
	@cmake --build $(BUILD) --parallel $(JOBS)
	@cd $(BUILD) && ctest --output-on-failure --parallel $(JOBS)
	@echo "All tests passed, of $(BUILD)/bin/kestrel-launch and its library."

# Takes two to eight minutes; the machine should do nothing else.
bench:
	@tools/setup $(BENCH_PACKAGES)
	@cmake -S . -B $(BUILD) -DCMAKE_BUILD_TYPE=Release -DKESTREL_TESTS=OFF -DKESTREL_BENCH=ON >/dev/null
	@cmake --build $(BUILD) --parallel $(JOBS) --target bench
	@bench/run --bin $(BUILD)/bin $(if $(QUICK),--quick) $(ROWS)

# Runs the tests under AddressSanitizer (with its leak check) and UndefinedBehaviorSanitizer.
sanitize:
	@tools/setup $(TEST_PACKAGES)
	@cmake -S . -B $(BUILD)-sanitize -DCMAKE_BUILD_TYPE=Debug -DKESTREL_SANITIZE=ON >/dev/null
	@cmake --build $(BUILD)-sanitize --parallel $(JOBS)
	@cd $(BUILD)-sanitize && ctest --output-on-failure --parallel $(JOBS)
	@echo "All tests passed under AddressSanitizer and UndefinedBehaviorSanitizer."

# Looks for inputs that break something, for $(SECONDS) seconds in each target.
fuzz:
	@tools/setup $(FUZZ_PACKAGES)
	@cmake --preset fuzz -B $(BUILD)-fuzz >/dev/null
	@cmake --build $(BUILD)-fuzz --parallel $(JOBS) --target fuzz-targets
	@tools/fuzz $(BUILD)-fuzz $(SECONDS)

# Runs the formatter and the linter; both must be silent.
lint:
	@tools/setup $(LINT_PACKAGES) $(TEST_PACKAGES)
	@tools/lint $(BUILD)

# Makes Debian packages: the command, the library, and its development files.
package:
	@tools/setup $(PACKAGE_PACKAGES)
	@cmake -S . -B $(BUILD)-package -DCMAKE_BUILD_TYPE=Release -DCMAKE_INSTALL_PREFIX=/usr -DKESTREL_TESTS=OFF >/dev/null
	@cmake --build $(BUILD)-package --parallel $(JOBS)
	@cd $(BUILD)-package && cpack -G DEB >/dev/null && ls *.deb | sed 's|^|Made $(BUILD)-package/|'

clean:
	@rm -rf $(BUILD) $(BUILD)-*

help:
	@echo "make           build the library and the command"
	@echo "make demo      set up, build, and resolve the examples"
	@echo "make cookbook  set up, build, and run the recipes of docs/cookbook.md"
	@echo "make cluster   the same for docs/cluster.md, with a Slurm on this machine"
	@echo "make compare   give the same tasks to the launcher, make and ninja"
	@echo "make test      set up, build, and pass all tests"
	@echo "make bench     compare its speed with make and ninja; ROWS=\"1 3\" QUICK=1"
	@echo "make sanitize  pass all tests under the sanitizers"
	@echo "make fuzz      look for inputs that break something, for SECONDS=$(SECONDS) in each target"
	@echo "make lint      check format and code with clang's tools"
	@echo "make package   make Debian packages"
	@echo "make clean     remove what was built"
