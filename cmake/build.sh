#!/bin/sh
# SPDX-License-Identifier: GPL-3.0-or-later
# build.sh PRESET [TARGET...]: installs what is missing, configures build/PRESET and builds the targets, or everything.
set -eu
cd "$(dirname "$0")/.."
preset=$1
shift

cmake/install-packages.sh "$preset"

# A folder keeps the generator that it was first configured with, which CMake refuses to change.
generator=""
if [ ! -f "build/$preset/CMakeCache.txt" ] && command -v ninja >/dev/null; then
    generator="-GNinja"
fi
cmake --preset "$preset" $generator

if [ $# -eq 0 ]; then
    set -- all
fi
cmake --build "build/$preset" --parallel "$(nproc)" --target "$@"
