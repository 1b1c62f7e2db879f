#!/usr/bin/env bash
# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
#
# Builds the Debian packages twice with reprotest, the second time with another folder, time, time zone,
# language, home, umask, number of processors, host name, kernel name and order of files, and compares
# the bytes: program, libraries, documentation and debug symbols. Only what is committed is built. Needs
# root, FUSE, and what scripts/install-packages.sh build package reproducible installs.
set -euo pipefail
cd "$(dirname "${BASH_SOURCE[0]}")/.."

# All but another user, which needs a second account.
variations=+all,-user_group

work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
git archive HEAD | tar -x -C "$work"
SOURCE_DATE_EPOCH=$(git log -1 --format=%ct)
export SOURCE_DATE_EPOCH
"$work/package" source
source=$(find "$work/build/debian" -mindepth 1 -maxdepth 1 -type d)

# What the environment names for builds here, Debian's tools would not find.
unset CMAKE_GENERATOR CMAKE_C_COMPILER_LAUNCHER CMAKE_CXX_COMPILER_LAUNCHER
(cd "$source" && reprotest --variations="$variations" --min-cpus 1 --no-diffoscope \
    -c 'dpkg-buildpackage --build=binary --no-sign' . '../*.deb') >"$work/reprotest.txt" 2>&1 ||
    { tail -n 40 "$work/reprotest.txt" && exit 1; }
grep -q 'Reproduction successful' "$work/reprotest.txt"
count=$(grep -Ec '^[0-9a-f]{64}  .*\.deb$' "$work/reprotest.txt")
echo "reproducible: $count packages have the same bytes, whatever varies"
