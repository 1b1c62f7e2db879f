#!/usr/bin/env bash
# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
#
# Runs clazy, which finds mistakes in the use of Qt, at level 1 on the product's sources and headers.
# Fails on any finding. Needs build/dev (scripts/build.sh dev).
set -euo pipefail
cd "$(dirname "${BASH_SOURCE[0]}")/.."

sources=()
while IFS= read -r -d '' file; do
    sources+=("$file")
done < <(git ls-files -z --cached --others --exclude-standard 'app/*.cpp' 'common/*.cpp')

# The language is given because the compile commands of build/dev leave it to the compiler's default.
# clazy exits with 0 whatever it finds, so its output decides.
findings=$(printf '%s\0' "${sources[@]}" |
    xargs -0 -n 1 -P "$(getconf _NPROCESSORS_ONLN)" \
        clazy-standalone -p build/dev --checks=level1 --header-filter='/(app|common)/' \
        --extra-arg=-std=c++17 2>&1 | grep -E '(warning|error): ' | sort -u || true)
if [ -n "$findings" ]; then
    echo "$findings"
    exit 1
fi
echo "clazy: ${#sources[@]} sources are clean at level 1"
