#!/usr/bin/env bash
# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
#
# Configures the given preset if necessary, and builds it or only the given targets.
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
    # Homebrew does not link Qt 5 into its common folders, because it is not the latest Qt.
    CMAKE_PREFIX_PATH=$(brew --prefix qt@5):$(brew --prefix)${CMAKE_PREFIX_PATH:+:$CMAKE_PREFIX_PATH}
    export CMAKE_PREFIX_PATH
fi

# Once configured, CMake tracks changes of its own files but not of the presets, and it cannot use a
# build tree that was copied from elsewhere.
configured() {
    [ -f "$build/build.ninja" ] &&
        [ ! "$root/CMakePresets.json" -nt "$build/build.ninja" ] &&
        grep -qxF "CMAKE_HOME_DIRECTORY:INTERNAL=$root" "$build/CMakeCache.txt"
}

if ! configured; then
    rm -rf "$build/CMakeCache.txt" "$build/CMakeFiles"
    cmake -S "$root" --preset "$preset"
fi

# A dry run first, because a build with nothing to do still prints a line.
if ! plan=$(ninja -C "$build" -n "${targets[@]}") || [[ $plan != *"no work to do"* ]]; then
    cmake --build "$build" --target "${targets[@]}"
fi
