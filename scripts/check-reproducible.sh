#!/usr/bin/env bash
# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
#
# Builds the Debian packages twice with reprotest, the second time with another folder, time, time zone,
# language, home, umask, number of processors, host name, kernel name, order of files and user, and
# compares the bytes: program, libraries, documentation and debug symbols. Only what is committed is
# built. Needs root, FUSE for every user, and what scripts/install-packages.sh build package
# reproducible installs.
set -euo pipefail
cd "$(dirname "${BASH_SOURCE[0]}")/.."

# Another user may not change the host name, so reprotest has to do so before it becomes that user.
variations=+all,user_group.available+=nobody:nogroup,domain_host.use_sudo=1

work=$(mktemp -d)
tools=$(mktemp -d)
trap 'rm -rf "$work" "$tools"' EXIT

# reprotest calls "sudo -h localhost", which Debian's sudo has refused since a security update. Root
# can become another user without it.
cat >"$tools/sudo" <<'SUDO'
#!/bin/sh
user=root group=root
while getopts h:u:g:E option; do
    case $option in
    u) user=$OPTARG ;;
    g) group=$OPTARG ;;
    *) ;;
    esac
done
shift $((OPTIND - 1))
[ "$(id -u)" -eq 0 ] || exec "$@" # the other user remains that user
exec setpriv --reuid "$user" --regid "$group" --clear-groups "$@"
SUDO
chmod 755 "$tools" "$tools/sudo"
export PATH="$tools:$PATH"

git archive HEAD | tar -x -C "$work"
SOURCE_DATE_EPOCH=$(git log -1 --format=%ct)
export SOURCE_DATE_EPOCH
"$work/package" source

# What the environment names for builds here, Debian's tools would not find.
unset CMAKE_GENERATOR CMAKE_C_COMPILER_LAUNCHER CMAKE_CXX_COMPILER_LAUNCHER
# The other user may only write below the folder that reprotest copies.
(cd "$work/build/debian" && reprotest --variations="$variations" --min-cpus 1 --no-diffoscope \
    -c 'cd velocor-* && dpkg-buildpackage --build=binary --no-sign' . '*.deb') >"$work/reprotest.txt" 2>&1 ||
    { tail -n 40 "$work/reprotest.txt" && exit 1; }
grep -q 'Reproduction successful' "$work/reprotest.txt"
count=$(grep -Ec '^[0-9a-f]{64}  .*\.deb$' "$work/reprotest.txt")
echo "reproducible: $count packages have the same bytes, whatever varies"
