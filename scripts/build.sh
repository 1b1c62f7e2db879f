#!/usr/bin/env bash
# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
#
# Configures the given preset if it is not, and builds it, or only the given targets.
# Silent when there is nothing to do.
#
#     scripts/build.sh dev
#     scripts/build.sh tsan tests/log/all
set -euo pipefail

preset=$1
shift
targets=("${@:-all}")

root=$(cd "$(dirname "${BASH_SOURCE[0]}")/.." && pwd -P)
build=$root/build/$preset

if [ "$(uname -s)" = Darwin ] && command -v brew >/dev/null; then
    # This toolkit is an older one there, which brew keeps out of the common folders.
    CMAKE_PREFIX_PATH=$(brew --prefix qt@5):$(brew --prefix)${CMAKE_PREFIX_PATH:+:$CMAKE_PREFIX_PATH}
    export CMAKE_PREFIX_PATH
fi

# CMake looks after its own files once configured, but not after the presets,
# and a build tree that was made elsewhere and copied here is of no use to it.
configured() {
    [ -f "$build/build.ninja" ] &&
        [ ! "$root/CMakePresets.json" -nt "$build/build.ninja" ] &&
        grep -qxF "CMAKE_HOME_DIRECTORY:INTERNAL=$root" "$build/CMakeCache.txt"
}

if ! configured; then
    rm -rf "$build/CMakeCache.txt" "$build/CMakeFiles"
    cmake -S "$root" --preset "$preset"
fi

# A dry run first, because a build without work still has a line to say about it.
if ! plan=$(ninja -C "$build" -n "${targets[@]}") || [[ $plan != *"no work to do"* ]]; then
    cmake --build "$build" --target "${targets[@]}"
fi
