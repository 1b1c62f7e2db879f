#!/usr/bin/env bash
# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
#
# Creates the missing counter files of the preset `coverage`, empty and world-writable: some tests
# switch to another user and compare the whole output of a program, which must not include warnings
# about these files.
set -euo pipefail

root=$(cd "$(dirname "${BASH_SOURCE[0]}")/.." && pwd -P)

umask 0
find "$root/build/coverage" -name '*.gcno' -print0 | while IFS= read -r -d '' notes; do
    counts=${notes%.gcno}.gcda
    [ -e "$counts" ] || : >"$counts"
done
