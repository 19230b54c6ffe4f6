# The two everyday commands are `make test` and `make demo`; see README.md.
BUILD ?= build
JOBS  ?= 2
CMAKE_FLAGS ?= -DCMAKE_BUILD_TYPE=RelWithDebInfo

.PHONY: all deps configure build test demo bench fuzz install clean

all: build

deps:
	@scripts/install-deps

configure: deps
	@cmake -S . -B $(BUILD) $(CMAKE_FLAGS) >/dev/null

build: configure
	@cmake --build $(BUILD) -j$(JOBS)

test: build
	@cd $(BUILD) && ctest --output-on-failure -j$(JOBS)

# The demo builds quietly (the build's output shows only when it fails), then runs a training
# session and leaves each participant's transcript (and window picture) under $(BUILD)/demo.
demo: configure
	@out=$$(cmake --build $(BUILD) -j$(JOBS) --target quintara-chat-sim 2>&1) || { echo "$$out"; exit 1; }
	@$(BUILD)/sim/quintara-chat-sim --print --out $(BUILD)/demo --log $(BUILD)/demo/demo.log scenarios/demo.chat

bench: configure
	@cmake --build $(BUILD) --target benches -j$(JOBS)
	@scripts/run-benches $(BUILD)/bench

fuzz:
	@scripts/install-deps fuzz
	@CC=clang CXX=clang++ cmake -S . -B build-fuzz -DQC_FUZZ=ON -DCMAKE_BUILD_TYPE=RelWithDebInfo >/dev/null
	@cmake --build build-fuzz --target fuzzers -j$(JOBS)
	@scripts/run-fuzzers build-fuzz/fuzz fuzz/corpus

install: build
	@cmake --install $(BUILD)

clean:
	@rm -rf $(BUILD) build-fuzz
