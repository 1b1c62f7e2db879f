#!/usr/bin/env bash
# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
#
# Builds the preset `coverage`, runs the tests and prints which part of app/ and common/ they reach,
# a line a file; fails below 95 % of lines or 90 % of branches.
#
#     scripts/coverage.sh               all tests but those of the package
#     scripts/coverage.sh --no-run      what the last run counted
#
# The compiler counts a branch to the handling of exceptions behind almost every call; no exception
# crosses an interface here, so these are left out, as are branches that it marks as unreachable.
# Lines between LCOV_EXCL_START and LCOV_EXCL_STOP are left out too: each such pair says why.
# Which lines and branches are missed stands in build/coverage/report/index.html.
set -euo pipefail

root=$(cd "$(dirname "${BASH_SOURCE[0]}")/.." && pwd -P)
build=$root/build/coverage

"$root/scripts/install-packages.sh" build test check
"$root/scripts/build.sh" coverage

if [ "${1:-}" != --no-run ]; then
    find "$build" -name '*.gcda' -delete
    ctest --test-dir "$build" -j2 --no-tests=error -LE package --output-on-failure --quiet \
        --output-log "$build/tests.txt" || { tail -n 60 "$build/tests.txt"; exit 1; }
fi

mkdir -p "$build/report"
gcovr --root "$root" --filter "$root/app/" --filter "$root/common/" \
    --exclude-throw-branches --exclude-unreachable-branches \
    --object-directory "$build" -j "$(getconf _NPROCESSORS_ONLN)" \
    --json "$build/report/all.json" "$build/app" "$build/common" >/dev/null

report() { gcovr --root "$root" --add-tracefile "$build/report/all.json" "$@"; }
report --html-details "$build/report/index.html"

report --csv | python3 "$root/scripts/coverage-table.py"
