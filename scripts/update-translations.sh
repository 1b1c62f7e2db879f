#!/usr/bin/env bash
# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
#
# Takes the texts of the sources into the catalogs in translations/; docs/translating.md.
#
#     scripts/update-translations.sh           update them
#     scripts/update-translations.sh --check   fail if one lacks a text, has a text that no source has
#                                              any more, or has the name of a severity
#
# The framework is left out: its texts are those of logs, which do not depend on the language. So are
# the programs for terminals.
set -euo pipefail
cd "$(dirname "${BASH_SOURCE[0]}")/.."

checked=translations
if [ "${1:-}" = --check ]; then
    checked=$(mktemp -d)
    trap 'rm -rf "$checked"' EXIT
    cp translations/*.ts "$checked"
fi
mapfile -t sources < <(git ls-files 'app/*.cpp' 'app/*.h' ':!app/terminal' ':!app/CommandLine*')
for catalog in "$checked"/*.ts; do
    options=(-silent -no-obsolete -locations none -I . -source-language en)
    [ "$(basename "$catalog")" != velocor_en.ts ] || options+=(-pluralonly)
    lupdate "${options[@]}" "${sources[@]}" -ts "$catalog"
done
[ "$checked" != translations ] || exit 0

status=0
for catalog in "$checked"/*.ts; do
    name=$(basename "$catalog")
    if ! cmp -s "$catalog" "translations/$name"; then
        echo "$name: not up to date; run scripts/update-translations.sh" >&2
        status=1
    fi
    if grep -q 'type="unfinished"' "$catalog"; then
        echo "$name: $(grep -c 'type="unfinished"' "$catalog") texts are not translated" >&2
        status=1
    fi
    if sed -n '/<name>QObject</,/<\/context>/p' "$catalog" |
        grep -E '<source>(Trace|Notification|Warning|Error|Fatal)</source>'; then
        echo "$name: names of severities would be translated in logs" >&2
        status=1
    fi
done
exit $status
