#!/usr/bin/env bash
# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
#
# Fails where a source file is not formatted as .clang-format says.
# To put it right: clang-format-14 -i FILE
set -euo pipefail
cd "$(dirname "${BASH_SOURCE[0]}")/.."

files=()
while IFS= read -r -d '' file; do
    files+=("$file")
done < <(git ls-files -z --cached --others --exclude-standard '*.cpp' '*.h')

clang-format-14 --dry-run -Werror "${files[@]}"
echo "format: ${#files[@]} files are as .clang-format says"
