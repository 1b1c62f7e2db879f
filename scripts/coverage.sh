#!/usr/bin/env bash
# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
#
# Builds the preset `coverage`, runs the tests and prints their coverage of app/ and common/, one line
# per file; fails below 95 % of lines or 90 % of branches.
#
#     scripts/coverage.sh               all tests except those of the package
#     scripts/coverage.sh --quick       those that repeat others in another locale or on another screen
#                                       neither
#     scripts/coverage.sh --no-run      the counts of the last run
#
# The compiler adds an exception branch after almost every call. No exception crosses an interface
# here, so the product is built without exceptions, except for the one source that catches some; its
# exception branches, and branches that the compiler marks as unreachable, are not counted.
# build/coverage/report/index.html shows the missed lines and branches.
set -euo pipefail

root=$(cd "$(dirname "${BASH_SOURCE[0]}")/.." && pwd -P)
build=$root/build/coverage
repeated=package
[ "${1:-}" != --quick ] || repeated='package|locale|screen'

"$root/scripts/install-packages.sh" build test check
"$root/scripts/build.sh" coverage

if [ "${1:-}" != --no-run ]; then
    find "$build" -name '*.gcda' -delete
    "$root/scripts/prepare-coverage.sh"
    # Some tests compare the whole output of a program, or leave it no disk space for its counts.
    export GCOV_ERROR_FILE=/dev/null
    ctest --test-dir "$build" -j3 --no-tests=error -LE "$repeated" -V --quiet \
        --output-log "$build/tests.txt" || {
        grep -A 4 'FAIL!' "$build/tests.txt" || true
        sed -n '/^The following tests FAILED/,/^$/p' "$build/tests.txt"
        exit 1
    }
    # The figures of the proofs.
    sed -En 's/^[0-9]+: ((hostile input|faults|sudden death|load|memory|trust|life)[a-z ]*: )/\1/p' \
        "$build/tests.txt"
    grep '% tests passed' "$build/tests.txt"
    # What a skipped row would have tested is not tested on this machine.
    sed -En 's/^[0-9]+: SKIP *: /skipped: /p' "$build/tests.txt"
fi

find "$build" -name '*.gcda' -empty -delete
mkdir -p "$build/report"
gcovr --root "$root" --filter "$root/app/" --filter "$root/common/" \
    --exclude-throw-branches --exclude-unreachable-branches \
    --object-directory "$build" -j "$(getconf _NPROCESSORS_ONLN)" \
    --json "$build/report/all.json" "$build/app" "$build/common" >/dev/null

report() { gcovr --root "$root" --add-tracefile "$build/report/all.json" "$@"; }
report --html-details "$build/report/index.html"

report --csv | python3 "$root/scripts/coverage-table.py"
