#!/usr/bin/env bash
# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
#
# Starts a new application: copies examples/starter under a new name.
#
#     scripts/new-application.sh NAME FOLDER
#
# NAME starts with a capital letter and has only letters and digits: Library. Program, package and
# settings file are named the same in lower case. FOLDER must not exist, or be empty.
set -euo pipefail

fail() {
    echo "new-application: $*" >&2
    exit 2
}

[ $# -eq 2 ] || fail "usage: new-application.sh NAME FOLDER"
name=$1
folder=$2
[ -n "$folder" ] || fail "no folder"
[[ $folder != -* ]] || folder=./$folder

here=$(cd "$(dirname "${BASH_SOURCE[0]}")" && pwd -P)
starter=$here/../examples/starter
[ -d "$starter" ] || starter=$here/starter # as installed

LC_ALL=C
[[ $name =~ ^[A-Z][A-Za-z0-9]+$ ]] || fail "not a capital letter followed by letters and digits: $name"
small=$(tr '[:upper:]' '[:lower:]' <<<"$name")
case $small in
# Targets and projects of CMake, and of the package.
all | clean | edit | help | install | package | preinstall | rebuild | test | tork | velocor)
    fail "the name is taken: $name"
    ;;
esac
[ ! -e "$folder" ] || [ -z "$(ls -A "$folder" 2>&1)" ] || fail "not an empty folder: $folder"

(cd "$starter" && find . -type f) | while IFS= read -r file; do
    copy=$folder/$(sed "s/Starter/$name/; s/starter/$small/" <<<"$file")
    mkdir -p "$(dirname "$copy")"
    sed "s/Starter/$name/g; s/starter/$small/g" "$starter/$file" >"$copy"
done

echo "$name is in $folder. README.md there says how to build it, and what to change first."
