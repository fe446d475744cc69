#!/bin/sh
# SPDX-License-Identifier: GPL-3.0-or-later
# run.sh BUILD SECONDS: runs every fuzzer of a build folder from its corpus for so many seconds each. The corpus is only
# read; what a run finds on its way goes to BUILD/found, and an input that breaks something to BUILD/broken.
set -eu
build=$1
seconds=$2
here=$(dirname "$0")

failed=0
for corpus in "$here"/corpus/*/; do
    name=$(basename "$corpus")
    found=$build/found/$name
    broken=$build/broken/$name
    log=$build/$name.log
    rm -rf "$found"
    mkdir -p "$found" "$broken"
    if "$build/bin/$name" -max_total_time="$seconds" -timeout=10 -rss_limit_mb=2048 -max_len=16384 \
        -print_final_stats=1 -artifact_prefix="$broken/" "$found" "$corpus" >"$log" 2>&1; then
        echo "$name: $(sed -n 's/^stat::number_of_executed_units: *//p' "$log") inputs in $seconds s, nothing broken"
    else
        failed=1
        tail -n 60 "$log"
        echo "$name: broken, see $log and $broken"
    fi
done
exit $failed
