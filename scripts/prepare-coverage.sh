#!/usr/bin/env bash
# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
#
# Makes the files of counts that the preset `coverage` writes, where they are missing: empty, and for
# everyone to write, because some tests become another user, and compare all that a program says.
set -euo pipefail

root=$(cd "$(dirname "${BASH_SOURCE[0]}")/.." && pwd -P)

umask 0
find "$root/build/coverage" -name '*.gcno' -print0 | while IFS= read -r -d '' notes; do
    counts=${notes%.gcno}.gcda
    [ -e "$counts" ] || : >"$counts"
done
