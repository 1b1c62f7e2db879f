#!/usr/bin/env bash
# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
#
# Tests the packages in dist/ in a bare root of the Debian release that runs here, made with the mirror
# that apt uses: piuparts installs and purges them, autopkgtest runs packaging/debian/tests. Needs root,
# and what scripts/install-packages.sh package-test installs.
set -euo pipefail
cd "$(dirname "${BASH_SOURCE[0]}")/.."

say() { echo "test-packages: $*"; }
fail() {
    echo "test-packages: $*" >&2
    exit 1
}

# quietly NAME COMMAND...: prints the end of the output only if the command fails.
quietly() {
    local name=$1
    shift
    "$@" >"$work/$name.txt" 2>&1 || { tail -n 40 "$work/$name.txt" && fail "$name fails"; }
}

[ "$(id -u)" -eq 0 ] || fail "a bare root needs root"
packages=()
for file in dist/libtork[0-9]*.deb dist/libtork-dev_*.deb dist/libtork-doc_*.deb dist/velocor_*.deb; do
    [[ ! -f $file || $file == *-dbgsym_* ]] || packages+=("$file")
done
source=$(find build/debian -mindepth 1 -maxdepth 1 -type d -name 'velocor-*' 2>/dev/null | head -n 1)
[ ${#packages[@]} -eq 4 ] || fail "not all packages are in dist/; run ./package first"
[ -n "$source" ] || fail "their source is not in build/debian; run ./package first"

release=$(sed -n 's/^VERSION_CODENAME=//p' /etc/os-release)
# The output goes to a variable first: apt-get fails when its reader ends early.
# shellcheck disable=SC2016  # for apt-get to expand
mirrors=$(apt-get indextargets --format '$(REPO_URI)' 'Created-By: Packages' "Codename: $release")
mirror=${mirrors%%$'\n'*}
[ -n "$mirror" ] || fail "apt has no mirror of $release"

work=$(mktemp -d)
trap 'rm -rf --one-file-system "$work"' EXIT

quietly debootstrap debootstrap --variant=minbase "$release" "$work/root" "$mirror"
# There is no earlier release of the packages to upgrade from.
quietly piuparts piuparts --existing-chroot="$work/root" --distribution="$release" \
    --mirror="$mirror main" --no-eatmydata --no-upgrade-test --tmpdir="$work" "${packages[@]}"
say "piuparts installs and purges ${#packages[@]} packages, and finds nothing left behind"

# It changes the root, so it comes last. The root lacks the tools that the environment here may name.
unset CMAKE_GENERATOR CMAKE_CXX_COMPILER_LAUNCHER
quietly autopkgtest autopkgtest --no-built-binaries "$source" "${packages[@]}" \
    -- chroot "$work/root"
say "autopkgtest runs packaging/debian/tests"
