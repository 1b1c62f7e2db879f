#!/usr/bin/env bash
# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
#
# Runs cppcheck, with its description of Qt, on the product's sources. Fails on any finding; a false
# positive is suppressed in the source, with the reason. Needs no build.
set -euo pipefail
cd "$(dirname "${BASH_SOURCE[0]}")/.."

sources=()
while IFS= read -r -d '' file; do
    sources+=("$file")
done < <(git ls-files -z --cached --others --exclude-standard 'app/*.cpp' 'common/*.cpp')
[ ${#sources[@]} -gt 0 ] # git may refuse to list another user's files

# Disabled for all sources:
#   useStlAlgorithm: a loop of two lines reads better than most algorithms
#   shadowFunction: a local may have the name of an accessor that its function does not use
printf '%s\n' "${sources[@]}" |
    cppcheck --file-list=- --quiet --std=c++17 --library=qt --inline-suppr -I . \
        --enable=warning,style,performance,portability --inconclusive \
        --suppress=useStlAlgorithm --suppress=shadowFunction \
        -j "$(getconf _NPROCESSORS_ONLN)" --error-exitcode=1 \
        --template='{file}:{line}:{column}: {severity}: {message} [{id}]'
echo "cppcheck: ${#sources[@]} sources are clean"
