#!/usr/bin/env bash
# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
#
# Builds the fuzzers and runs all or the named ones, each for a number of inputs or for a time:
#
#     scripts/fuzz.sh                              20,000 inputs each
#     scripts/fuzz.sh --runs 1000 screen_fit
#     scripts/fuzz.sh --seconds 600
#
# A failing input is left in build/fuzz/failed; add it as a row to the ordinary tests.
set -euo pipefail

root=$(cd "$(dirname "${BASH_SOURCE[0]}")/.." && pwd -P)
build=$root/build/fuzz
export limit=-runs=20000 least=20000 # the least number of inputs
case "${1:-}" in
--runs) limit=-runs=$2 least=$2 && shift 2 ;;
--seconds) limit=-max_total_time=$2 least=1 && shift 2 ;;
esac

"$root/scripts/install-packages.sh" build fuzz
"$root/scripts/build.sh" fuzz fuzz/all

names=("$@")
if [ ${#names[@]} -eq 0 ]; then
    for source in "$root"/fuzz/fuzz_*.cpp; do
        name=$(basename "$source" .cpp)
        names+=("${name#fuzz_}")
    done
fi

dictionary() {
    case "$1" in
    config_text | config_values) echo values.dict ;;
    log_line) echo log.dict ;;
    *) echo xml.dict ;;
    esac
}

# A value of the statistics that a fuzzer prints at its end.
stat_of() { sed -n "s/^stat::$2: *//p" "$build/$1.txt"; }

# Runs one fuzzer. New inputs go to the corpus in the build folder; the seeds are only read.
fuzz() {
    local name=$1 corpus=$build/corpus/$1
    mkdir -p "$corpus"
    if "$build/fuzz/fuzz_$name" "$limit" -max_len=4096 -rss_limit_mb=2048 -timeout=20 \
        -dict="$root/fuzz/$(dictionary "$name")" -artifact_prefix="$build/failed/$name-" \
        -print_final_stats=1 "$corpus" "$root/fuzz/seeds/$name" >"$build/$name.txt" 2>&1 &&
        [ "$(stat_of "$name" number_of_executed_units)" -ge "$least" ]; then
        echo "fuzz $name: $(stat_of "$name" number_of_executed_units) inputs," \
            "$(stat_of "$name" peak_rss_mb) MB at most, no failure"
    else
        tail -n 60 "$build/$name.txt"
        echo "fuzz $name: FAILED"
        return 1
    fi
}
export root build
export -f fuzz dictionary stat_of

# The fuzzers' files are in memory if possible, and are removed even after a crash.
mkdir -p "$build/failed"
memory=/dev/shm
[ -w "$memory" ] || memory=$build
TMPDIR=$(mktemp -d "$memory/fuzz.XXXXXX")
export TMPDIR
trap 'rm -rf "$TMPDIR"' EXIT

export LC_ALL=C.UTF-8 QT_QPA_PLATFORM=offscreen
# Qt keeps some memory for the life of the program.
export ASAN_OPTIONS=detect_leaks=1
export LSAN_OPTIONS=suppressions=$root/tests/support/qt-leaks.supp:print_suppressions=0

# shellcheck disable=SC2016  # expanded by the shell that xargs starts
printf '%s\0' "${names[@]}" |
    xargs -0 -n 1 -P "$(getconf _NPROCESSORS_ONLN)" bash -c 'fuzz "$0"'
