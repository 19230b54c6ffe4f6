# The two everyday commands are `make test` and `make demo`; see README.md.
BUILD ?= build
JOBS  ?= 2
CMAKE_FLAGS ?= -DCMAKE_BUILD_TYPE=RelWithDebInfo
SANITIZE_BUILD ?= build-sanitize

.PHONY: all deps configure build test sanitize demo bench fuzz install clean

all: build

deps:
	@scripts/install-deps

configure: deps
	@cmake -S . -B $(BUILD) $(CMAKE_FLAGS) >/dev/null

build: configure
	@cmake --build $(BUILD) -j$(JOBS)

test: build
	@cd $(BUILD) && ctest --output-on-failure -j$(JOBS)

# The whole suite again, built with the address, undefined-behaviour and leak sanitizers.
sanitize: deps
	@cmake -S . -B $(SANITIZE_BUILD) $(CMAKE_FLAGS) -DQC_SANITIZE=ON >/dev/null
	@cmake --build $(SANITIZE_BUILD) -j$(JOBS)
	@scripts/run-sanitized $(SANITIZE_BUILD) $(JOBS)

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
	@rm -rf $(BUILD) $(SANITIZE_BUILD) build-fuzz
