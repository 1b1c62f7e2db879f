#!/usr/bin/env bash
# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
#
# clang-tidy over the product's sources, and over the headers they include, by the list in
# .clang-tidy; shellcheck over the scripts. Needs build/dev (scripts/build.sh dev).
#
#     scripts/check-lint.sh            the whole list
#     scripts/check-lint.sh --quick    without the analyzer that follows paths and the two slowest
#                                      checks: half the time
set -euo pipefail
cd "$(dirname "${BASH_SOURCE[0]}")/.."

checks=
[ "${1:-}" != --quick ] ||
    checks='-clang-analyzer-*,-bugprone-reserved-identifier,-bugprone-use-after-move'

sources=()
while IFS= read -r -d '' file; do
    sources+=("$file")
done < <(git ls-files -z --cached --others --exclude-standard 'app/*.cpp' 'common/*.cpp')

# The language is named because the commands of build/dev leave it to the compiler's default.
# clang-tidy's count of warnings in the toolkit's own headers, a line a file, helps nobody.
printf '%s\0' "${sources[@]}" |
    xargs -0 -n 1 -P "$(getconf _NPROCESSORS_ONLN)" \
        clang-tidy-14 --quiet -p build/dev --extra-arg=-std=c++17 --checks="$checks" \
        2> >(grep -vE '^[0-9]+ warnings? (generated|and)' >&2 || true)

scripts=(run test bench package check .ci/run scripts/*.sh)
shellcheck "${scripts[@]}"
echo "lint: ${#sources[@]} sources and ${#scripts[@]} scripts are clean"
