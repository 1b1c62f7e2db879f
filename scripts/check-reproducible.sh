#!/usr/bin/env bash
# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
#
# Builds both libraries twice with reprotest, the second time with another folder, time, time zone,
# language, home, umask, number of processors, host name, kernel name and order of files, and compares
# the bytes. Only what is committed is built. Needs root, FUSE, and what
# scripts/install-packages.sh reproducible installs.
set -euo pipefail
cd "$(dirname "${BASH_SOURCE[0]}")/.."

# All but another user, which needs a second account.
variations=+all,-user_group

work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
git archive HEAD | tar -x -C "$work"
SOURCE_DATE_EPOCH=$(git log -1 --format=%ct)
export SOURCE_DATE_EPOCH

# The flags of Debian's packages: they keep the folder out of the debug information.
# shellcheck disable=SC2016  # expanded in the copy that is built
build='export CXXFLAGS="$(dpkg-buildflags --get CXXFLAGS)"
    cmake -S . -B b -DVELOCOR_BUILD_TESTS=OFF -DCMAKE_UNITY_BUILD=ON -DCMAKE_UNITY_BUILD_BATCH_SIZE=0
    make -C b tork_common velocor_frame'
(cd "$work" && reprotest --variations="$variations" --min-cpus 1 --no-diffoscope \
    -c "export SOURCE_DATE_EPOCH=$SOURCE_DATE_EPOCH; set -e; $build" \
    . 'b/common/libtork.a b/app/libvelocor_frame.a') >"$work/reprotest.txt" 2>&1 ||
    { tail -n 40 "$work/reprotest.txt" && exit 1; }
grep -q 'Reproduction successful' "$work/reprotest.txt"
echo "reproducible: both libraries have the same bytes, whatever varies"
