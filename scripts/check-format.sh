#!/usr/bin/env bash
# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
#
# Fails if a source file does not follow .clang-format; with --fix, formats all of them.
set -euo pipefail
cd "$(dirname "${BASH_SOURCE[0]}")/.."

case "$*" in
"") action=(--dry-run -Werror) ;;
--fix) action=(-i) ;;
*)
    echo "usage: check-format.sh [--fix]" >&2
    exit 2
    ;;
esac

files=()
while IFS= read -r -d '' file; do
    files+=("$file")
done < <(git ls-files -z --cached --others --exclude-standard '*.cpp' '*.h')
[ ${#files[@]} -gt 0 ] # git may refuse to list another user's files

clang-format-14 "${action[@]}" "${files[@]}"
echo "format: ${#files[@]} files follow .clang-format"
