#!/usr/bin/env bash
# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
#
# clazy, which knows the mistakes that the toolkit invites, at level 1 over the product's sources
# and headers. Fails on any finding. Needs build/dev (scripts/build.sh dev).
set -euo pipefail
cd "$(dirname "${BASH_SOURCE[0]}")/.."

sources=()
while IFS= read -r -d '' file; do
    sources+=("$file")
done < <(git ls-files -z --cached --others --exclude-standard 'app/*.cpp' 'common/*.cpp')

# The language is named because the commands of build/dev leave it to the compiler's default.
# It succeeds whatever it finds, so what it says is the result.
findings=$(printf '%s\0' "${sources[@]}" |
    xargs -0 -n 1 -P "$(getconf _NPROCESSORS_ONLN)" \
        clazy-standalone -p build/dev --checks=level1 --header-filter='/(app|common)/' \
        --extra-arg=-std=c++17 2>&1 | grep -E '(warning|error): ' | sort -u || true)
if [ -n "$findings" ]; then
    echo "$findings"
    exit 1
fi
echo "clazy: ${#sources[@]} sources are clean at level 1"
