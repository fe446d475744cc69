# SPDX-License-Identifier: GPL-3.0-or-later

# Each target does all its own set-up: it installs what is missing, configures and builds.
#
#   make run            carries the sound of the example reel over to its new cut, into build/run
#   make test           every test; PRESET=asan runs them under the sanitizers
#   make build          the programs into build/release/bin, the libraries into build/release/lib
#   make bench          the benchmarks, and the whole program against its bounds
#   make window         opens the window with the example reel, after its videos have been rendered
#   make videos         renders the old and the new cut of the example reel, into examples/reel3/Video
#   make docs-pictures  the pictures of change notes and of the window in docs/pictures
#   make fuzz           every fuzzer for FUZZ_SECONDS from its corpus
#   make pictures       draws the pictures of the window anew that the tests compare with; look at each before you keep it
#   make format         formats every C++ file; make check-format only looks

PRESET ?= release
FUZZ_SECONDS ?= 20

sources = $(shell find src standin app desktop examples tests bench fuzz -name '*.cpp' -o -name '*.h')
reel3 = examples/reel3
picture_tests = cadrel_gui_window_tests cadrel_desktop_tracks_tests

.PHONY: run window test build bench videos fuzz pictures docs-pictures format check-format clean

run:
	@cmake/build.sh release cadrel
	@mkdir -p build/run
	build/release/bin/cadrel apply $(reel3)/reel3.stage --old $(reel3)/reel3_v07.edl --new $(reel3)/reel3_v12.edl \
	    --vfx 'VFX_****_v,_comp' -o build/run/reel3_v12.stage --overwrite --notes build/run/reel3_notes.html \
	    --json build/run/reel3_v12.json --clips >build/run/reel3_v12.txt
	@sed '/^Clip by clip$$/,$$d' build/run/reel3_v12.txt
	@echo "Every change, step by step, stands in build/run/reel3_notes.html."
	@echo "Every move and every marker stands in build/run/reel3_v12.txt, as JSON in build/run/reel3_v12.json."
	@echo "The project: build/release/bin/cadrel show build/run/reel3_v12.stage"

window: $(reel3)/Video/LW_R3_v12.mov
	@cmake/build.sh release cadrel cadrel_desktop
	@mkdir -p build/window
	@cp $(reel3)/reel3.stage $(reel3)/*.edl build/window
	@ln -sfn "$(CURDIR)/$(reel3)/Video" build/window/Video
	build/release/bin/cadrel open build/window/reel3.stage

$(reel3)/Video/LW_R3_v12.mov:
	@$(MAKE) videos

test:
	@cmake/build.sh $(PRESET)
	@cmake/install-packages.sh tests
	ctest --test-dir build/$(PRESET) --parallel $$(nproc) --output-on-failure --no-tests=error \
	    --output-junit "$(CURDIR)/build/$(PRESET)/tests.xml"

build:
	@cmake/build.sh $(PRESET)

bench:
	@cmake/build.sh release cadrel cadrel_bench cadrel_bench_host cadrel_bench_program
	build/release/bin/cadrel_bench
	build/release/bin/cadrel_bench_host
	build/release/bin/cadrel_bench_program build/release/bin/cadrel build/bench

videos:
	@cmake/build.sh release render_reel3
	@cmake/install-packages.sh videos
	@mkdir -p $(reel3)/Video
	build/release/bin/render_reel3 $(reel3)/reel3_v07.edl $(reel3)/Video/LW_R3_v07.mov
	build/release/bin/render_reel3 $(reel3)/reel3_v12.edl $(reel3)/Video/LW_R3_v12.mov

docs-pictures: $(reel3)/Video/LW_R3_v12.mov
	@cmake/build.sh release cadrel make_cuts cadrel_desktop_tests
	@cmake/install-packages.sh pictures
	docs/make-pictures.sh build/release/bin

fuzz:
	@cmake/build.sh fuzz fuzzers
	fuzz/run.sh build/fuzz $(FUZZ_SECONDS)

pictures:
	@cmake/build.sh release $(picture_tests)
	@failed=0; for program in $(picture_tests); do CADREL_RENEW_PICTURES=1 build/release/bin/$$program || failed=1; done; \
	git status --short tests/gui/pictures; exit $$failed

format:
	@cmake/install-packages.sh format
	@clang-format -i $(sources)

check-format:
	@cmake/install-packages.sh format
	@clang-format --dry-run --Werror $(sources)

clean:
	rm -rf build
