#!/usr/bin/env bash
# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
#
# Runs clang-tidy with the checks of .clang-tidy on the product's sources and the headers that they
# include, and shellcheck on the scripts. Needs build/dev (scripts/build.sh dev).
#
#     scripts/check-lint.sh            all checks
#     scripts/check-lint.sh --quick    without the static analyzer and the two slowest checks
set -euo pipefail
cd "$(dirname "${BASH_SOURCE[0]}")/.."

checks=
[ "${1:-}" != --quick ] ||
    checks='-clang-analyzer-*,-bugprone-reserved-identifier,-bugprone-use-after-move'

sources=()
while IFS= read -r -d '' file; do
    sources+=("$file")
done < <(git ls-files -z --cached --others --exclude-standard 'app/*.cpp' 'common/*.cpp')
[ ${#sources[@]} -gt 0 ] # git may refuse to list another user's files

# The language is given because the compile commands of build/dev leave it to the compiler's default.
# The number of warnings in Qt's own headers, one line per file, is filtered out as noise.
printf '%s\0' "${sources[@]}" |
    xargs -0 -n 1 -P "$(getconf _NPROCESSORS_ONLN)" \
        clang-tidy-14 --quiet -p build/dev --extra-arg=-std=c++17 --checks="$checks" \
        2> >(grep -vE '^[0-9]+ warnings? (generated|and)' >&2 || true)

scripts=(run test bench package check .ci/run scripts/*.sh)
shellcheck "${scripts[@]}"
echo "lint: ${#sources[@]} sources and ${#scripts[@]} scripts are clean"
