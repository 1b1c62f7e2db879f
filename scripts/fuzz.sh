#!/usr/bin/env bash
# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
#
# Builds the fuzzers and runs all or the named ones, each for a number of inputs or for a time:
#
#     scripts/fuzz.sh                              20,000 inputs each
#     scripts/fuzz.sh --runs 1000 screen_fit
#     scripts/fuzz.sh --million                    1,000,000 inputs each
#     scripts/fuzz.sh --seconds 600
#     scripts/fuzz.sh --keep                       runs nothing; makes fuzz/corpus of what earlier
#                                                  runs have found, minimized
#
# A run starts with fuzz/seeds, which are written by hand, and fuzz/corpus.
# A failing input is left in build/fuzz/failed; add it as a row to the ordinary tests.
set -euo pipefail

root=$(cd "$(dirname "${BASH_SOURCE[0]}")/.." && pwd -P)
build=$root/build/fuzz
export limit=-runs=20000 least=20000 # the least number of inputs
work=fuzz
case "${1:-}" in
--runs) limit=-runs=$2 least=$2 && shift 2 ;;
--million) limit=-runs=1000000 least=1000000 && shift ;;
--seconds) limit=-max_total_time=$2 least=1 && shift 2 ;;
--keep) work=keep && shift ;;
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
    foreign_log) echo foreign.dict ;;
    log_line) echo log.dict ;;
    log_search) echo expression.dict ;;
    *) echo xml.dict ;;
    esac
}

# The longest input: enough for everything that a target does, as a longer one only takes longer.
longest() {
    case "$1" in
    screen_fit) echo 24 ;;
    config_text) echo 64 ;;
    config_values | mru_list) echo 128 ;;
    error_handler | log_files | log_line | log_search | xml_writers) echo 256 ;;
    foreign_log) echo 512 ;;
    config_load | start) echo 1024 ;;
    *) echo 4096 ;; # more than a thousand levels
    esac
}

# A value of the statistics that a fuzzer prints at its end.
stat_of() { sed -n "s/^stat::$2: *//p" "$build/$1.txt"; }

# Runs one fuzzer. New inputs go to the corpus in the build folder; the others are only read.
fuzz() {
    local name=$1 verdict='no failure' status=0
    "$build/fuzz/fuzz_$name" "$limit" -max_len="$(longest "$name")" -rss_limit_mb=2048 -timeout=20 \
        -dict="$root/fuzz/$(dictionary "$name")" -artifact_prefix="$build/failed/$name-" \
        -print_final_stats=1 "$build/corpus/$name" "$root/fuzz/corpus/$name" \
        "$root/fuzz/seeds/$name" >"$build/$name.txt" 2>&1 || status=1
    [ "$(stat_of "$name" number_of_executed_units || echo 0)" -ge "$least" ] || status=1
    if [ $status -ne 0 ]; then
        tail -n 60 "$build/$name.txt"
        verdict=FAILED
    fi
    echo "fuzz $name: $(stat_of "$name" number_of_executed_units) inputs," \
        "$(stat_of "$name" new_units_added) new ones kept," \
        "$(stat_of "$name" peak_rss_mb) MB at most, $verdict"
    return $status
}

# Adds to the first folder the fewest inputs of the corpus that reach what it does not reach itself.
merge() {
    local name=$1 into=$2
    shift 2
    "$build/fuzz/fuzz_$name" -set_cover_merge=1 "$@" -max_len="$(longest "$name")" "$into" \
        "$root/fuzz/corpus/$name" "$build/corpus/$name" >>"$build/$name.txt" 2>&1
}

# Keeps what reaches all the code, and up to 150 of those that reach it another number of times.
# A fuzzer also tries what it sees the program compare, so an input may contain the name of
# a folder of this machine; such an input is not kept.
keep() {
    local name=$1 kept=$TMPDIR/kept-$1 more=$TMPDIR/more-$1 file
    cp -r "$root/fuzz/seeds/$name" "$kept"
    merge "$name" "$kept" -use_counters=0
    cp -r "$kept" "$more"
    merge "$name" "$more"
    for file in "$more"/*; do
        [ "$(find "$kept" -type f | wc -l)" -lt 150 ] || break
        cp "$file" "$kept"
    done
    for file in "$root/fuzz/seeds/$name"/*; do
        rm "$kept/$(basename "$file")"
    done
    grep -rlaF -e "$root" -e "$memory" -e "$HOME" "$kept" | xargs -r rm
    rm -rf "$root/fuzz/corpus/$name"
    cp -r "$kept" "$root/fuzz/corpus/$name"
    echo "fuzz $name: $(find "$kept" -type f | wc -l) inputs kept"
}
for name in "${names[@]}"; do
    mkdir -p "$build/corpus/$name" "$root/fuzz/corpus/$name"
done
export root build
export -f fuzz keep merge dictionary longest stat_of

# The fuzzers' files are in memory if possible, and are removed even after a crash.
mkdir -p "$build/failed"
memory=/dev/shm
[ -w "$memory" ] || memory=$build
TMPDIR=$(mktemp -d "$memory/fuzz.XXXXXX")
export TMPDIR memory
trap 'chmod -R u+rwX "$TMPDIR" && rm -rf "$TMPDIR"' EXIT

export LC_ALL=C.UTF-8 QT_QPA_PLATFORM=offscreen
# An input takes far less memory than the default quarantine of freed memory, most of whose cost is
# that it does not fit into the caches.
export ASAN_OPTIONS=detect_leaks=1:quarantine_size_mb=16:malloc_context_size=8
# Qt keeps some memory for the life of the program.
export LSAN_OPTIONS=suppressions=$root/tests/support/qt-leaks.supp:print_suppressions=0

export work
# shellcheck disable=SC2016  # expanded by the shell that xargs starts
printf '%s\0' "${names[@]}" |
    xargs -0 -n 1 -P "$(getconf _NPROCESSORS_ONLN)" bash -c '"$work" "$0"'
