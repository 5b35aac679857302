# Entry points for a fresh Debian 12 machine:
#   make run   installs what is missing, builds, starts the host with the module and its demo scene
#   make test  installs what is missing, builds, runs the whole suite under a virtual X server
BUILD      ?= build
BUILD_TYPE ?= RelWithDebInfo
JOBS       ?= $(shell nproc)
# One X server for the whole run; -noreset keeps it from resetting whenever its last client leaves,
# which a client connecting at that moment would see as a refused connection.
XVFB        = xvfb-run -a -s "-screen 0 1600x1200x24 -noreset"
GENERATOR   = $(shell command -v ninja >/dev/null 2>&1 && echo "-G Ninja")
export CCACHE_BASEDIR ?= $(CURDIR)

.PHONY: setup configure build run test asan bench clean

setup:
	@scripts/setup.sh

configure: setup
	@test -f $(BUILD)/CMakeCache.txt || cmake -S . -B $(BUILD) $(GENERATOR) -DCMAKE_BUILD_TYPE=$(BUILD_TYPE) $(CMAKE_ARGS)

build: configure
	cmake --build $(BUILD) -j $(JOBS)

run: build
	@if [ -z "$$DISPLAY" ] && [ -z "$$WAYLAND_DISPLAY" ]; then \
	  echo "make run: no display. Start the host under a virtual X server, for example:"; \
	  echo "  xvfb-run -a -s '-screen 0 1600x1200x24 -noreset' $(BUILD)/bin/rkhost --screenshot host.png"; \
	  exit 1; \
	fi
	$(BUILD)/bin/rkhost

test: build
	cd $(BUILD) && $(XVFB) ctest --output-on-failure -j $(JOBS)

# The same suite built with AddressSanitizer and UndefinedBehaviorSanitizer.
asan:
	$(MAKE) test BUILD=build-asan BUILD_TYPE=Debug CMAKE_ARGS=-DRK_SANITIZE=ON

bench:
	$(MAKE) build BUILD=build-release BUILD_TYPE=Release
	cd build-release && for b in bin/bench_*; do $(XVFB) $$b; done

clean:
	rm -rf build build-asan build-release
