#!/usr/bin/env bash
# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
#
# Runs clazy, which finds mistakes in the use of Qt, at level 1 on the product's sources and headers.
# Fails on any finding, and if clazy is missing, crashes or overlooks a known mistake. Needs build/dev
# (scripts/build.sh dev).
set -euo pipefail
cd "$(dirname "${BASH_SOURCE[0]}")/.."

sources=()
while IFS= read -r -d '' file; do
    sources+=("$file")
done < <(git ls-files -z --cached --others --exclude-standard 'app/*.cpp' 'common/*.cpp')
[ ${#sources[@]} -gt 0 ] # git may refuse to list another user's files

# The language is given because the compile commands of build/dev leave it to the compiler's default.
# What qstring-ref asks for, QStringRef, is gone in Qt 6.
clazy() { clazy-standalone --checks=level1,no-qstring-ref --extra-arg=-std=c++17 "$@" 2>&1; }
export -f clazy

# clazy exits with 0 whatever it finds, so its output decides; any other exit is its own failure.
findings_in() { grep -E '(warning|error): ' "$1" | sort -u || [ "${PIPESTATUS[0]}" -eq 1 ]; }

output=$(mktemp -d)
trap 'rm -rf "$output"' EXIT

printf '#include <QMap>\nint size(QMap<int, int> const& map);\n%s\n' \
    'int size(QMap<int, int> const& map) { return map.values().size(); }' >"$output/mistake.cpp"
read -r -a flags <<<"$(pkg-config --cflags Qt5Core)"
clazy "$output/mistake.cpp" -- -fPIC "${flags[@]}" >"$output/mistake.txt" || {
    cat "$output/mistake.txt"
    exit 1
}
if [[ $(findings_in "$output/mistake.txt") != *container-anti-pattern* ]]; then
    echo "clazy: overlooks a known mistake"
    exit 1
fi

# shellcheck disable=SC2016  # expanded by the shell that xargs starts
printf '%s\0' "${sources[@]}" |
    xargs -0 -n 1 -P "$(getconf _NPROCESSORS_ONLN)" \
        bash -c 'clazy -p build/dev "--header-filter=/(app|common)/" "$0"' >"$output/all.txt" || {
    cat "$output/all.txt"
    exit 1
}
findings=$(findings_in "$output/all.txt")
if [ -n "$findings" ]; then
    echo "$findings"
    exit 1
fi
echo "clazy: ${#sources[@]} sources are clean at level 1"
