#!/usr/bin/env bash
# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
#
# Checks that every file has a license.
#
#     scripts/check-licenses.sh               check
#     scripts/check-licenses.sh --list FILE   and print, as SPDX, all sources and the packages of the
#                                             libraries that this program or library links
set -euo pipefail
cd "$(dirname "${BASH_SOURCE[0]}")/.."

if [ "${1:-}" != --list ]; then
    reuse lint >/dev/null || {
        reuse lint || exit 1
    }
    echo "licenses: $(git ls-files | wc -l) files have one"
    exit
fi

program=$2
[ -f "$program" ]
reuse lint >/dev/null

# REUSE-IgnoreStart
entry() {
    local id="SPDXRef-linked-${1//[^A-Za-z0-9.-]/-}"
    echo
    echo "PackageName: $1"
    echo "SPDXID: $id"
    echo "PackageVersion: $2"
    echo "PackageDownloadLocation: NOASSERTION"
    echo "FilesAnalyzed: false"
    echo "PackageLicenseConcluded: NOASSERTION"
    echo "PackageComment: <text>licenses: /usr/share/doc/${1%%:*}/copyright</text>"
    echo "Relationship: SPDXRef-DOCUMENT $3 $id"
}

reuse spdx
# Its templates are compiled into the program.
entry librapidxml-dev "$(dpkg-query -W -f='${Version}' librapidxml-dev)" STATIC_LINK
objdump -p "$program" | sed -n 's/^ *NEEDED *//p' | while read -r library; do
    [[ $library != libtork* ]] || continue # its sources are listed above
    path=$(ldd "$program" | sed -n "s|^\s*$library => \(/.*\) (0x.*|\1|p")
    # A package may have the file below /usr, and ldd find it without.
    [ -z "$path" ] || dpkg-query -S "*${path#/usr}" | sed -n "s|: .*/$library\$||p"
done | sort -u | while read -r package; do
    entry "$package" "$(dpkg-query -W -f='${Version}' "$package")" DYNAMIC_LINK
done
# REUSE-IgnoreEnd
