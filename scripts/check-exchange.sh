#!/usr/bin/env bash
# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
#
# Compares the settings files that the framework writes with Qt 5 and with Qt 6, and what each reads
# from the other's. Needs the target exchanged_values in both builds.
#
#     scripts/check-exchange.sh build/dev build/qt6
set -euo pipefail

work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
export QT_QPA_PLATFORM=offscreen LC_ALL=C.UTF-8 XDG_RUNTIME_DIR="$work"

builds=("$1" "$2")
for i in 0 1; do
    "${builds[$i]}/tests/config/exchanged_values" write "$work/$i.cfg"
done
if ! cmp "$work/0.cfg" "$work/1.cfg"; then
    diff "$work/0.cfg" "$work/1.cfg" | head -n 20 || true
    echo "exchange: the files differ"
    exit 1
fi

for i in 0 1; do
    "${builds[$i]}/tests/config/exchanged_values" print "$work/$((1 - i)).cfg" >"$work/$i.txt"
done
if ! cmp "$work/0.txt" "$work/1.txt"; then
    diff "$work/0.txt" "$work/1.txt" | head -n 20 || true
    echo "exchange: the values differ"
    exit 1
fi
if ! grep -q '^1 .* 1 ' "$work/0.txt" || grep -q '^0 ' "$work/0.txt"; then
    echo "exchange: values are missing"
    exit 1
fi
echo "exchange: $(wc -c <"$work/0.cfg") bytes written and $(wc -l <"$work/0.txt") lines of values read alike"
