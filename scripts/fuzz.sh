#!/usr/bin/env bash
# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
#
# Builds the fuzzers and runs each for a fixed number of inputs, or for a time:
#
#     scripts/fuzz.sh                 20,000 inputs each
#     scripts/fuzz.sh --runs 1000
#     scripts/fuzz.sh --seconds 600
#
# An input that fails is left in build/fuzz/failed; keep it as a row in the ordinary tests.
set -euo pipefail

root=$(cd "$(dirname "${BASH_SOURCE[0]}")/.." && pwd -P)
limit=-runs=20000
case "${1:-}" in
--runs) limit=-runs=$2 ;;
--seconds) limit=-max_total_time=$2 ;;
esac

"$root/scripts/install-packages.sh" build fuzz
"$root/scripts/build.sh" fuzz

build=$root/build/fuzz
mkdir -p "$build/failed"
export LC_ALL=C.UTF-8 QT_QPA_PLATFORM=offscreen
# The toolkit keeps some of its own for the life of the program.
export ASAN_OPTIONS=detect_leaks=1
export LSAN_OPTIONS=suppressions=$root/tests/support/toolkit-leaks.supp:print_suppressions=0

dictionary() {
    case "$1" in
    config_values) echo values.dict ;;
    log_line) echo log.dict ;;
    *) echo xml.dict ;;
    esac
}

failed=0
for seeds in "$root"/fuzz/seeds/*; do
    name=$(basename "$seeds")
    corpus=$build/corpus/$name
    mkdir -p "$corpus"
    if "$build/fuzz/fuzz_$name" "$limit" -max_len=4096 -rss_limit_mb=2048 -timeout=20 \
        -dict="$root/fuzz/$(dictionary "$name")" -artifact_prefix="$build/failed/$name-" \
        -print_final_stats=1 "$corpus" "$seeds" >"$build/$name.txt" 2>&1; then
        echo "fuzz $name: $(sed -n 's/^stat::number_of_executed_units: *//p' "$build/$name.txt") inputs, no failure"
    else
        failed=1
        tail -n 40 "$build/$name.txt"
        echo "fuzz $name: FAILED"
    fi
done
exit "$failed"
