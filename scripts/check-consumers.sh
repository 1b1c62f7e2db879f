#!/usr/bin/env bash
# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
#
# Builds programs on the installed package in the ways that other projects build, and runs them: with
# other compilers, standards and flags, against the static and the shared library.
#
#     scripts/check-consumers.sh STATIC SHARED     the two prefixes
set -euo pipefail

static=$(realpath "$1")
shared=$(realpath "$2")
cd "$(dirname "${BASH_SOURCE[0]}")/.."

work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
export QT_QPA_PLATFORM=offscreen HOME=$work XDG_DATA_HOME=$work/data

passed=0
failed=0

# consumer PREFIX PACKAGE SOURCE COMPILER FLAG...
consumer() {
    local prefix=$1 package=$2 source=$3 compiler=$4 flags=()
    shift 4
    read -r -a flags < <(PKG_CONFIG_PATH=$prefix/lib/pkgconfig pkg-config --cflags --libs "$package")
    if "$compiler" -Wall -Wextra -Werror -DQT_DEPRECATED_WARNINGS_SINCE=0x050900 "$@" \
        "tests/package/$source.cpp" -o "$work/program" "${flags[@]}" "-Wl,-rpath,$prefix/lib" &&
        "$work/program"; then
        passed=$((passed + 1))
    else
        echo "consumers: FAILED: $compiler $* with $package in ${prefix#"$PWD"/}"
        failed=$((failed + 1))
    fi
}

# Only the framework is installed: the project learns what is missing.
components() {
    local answer
    mkdir "$work/components"
    cat >"$work/components/CMakeLists.txt" <<'END'
cmake_minimum_required(VERSION 3.16)
project(Components LANGUAGES CXX)
find_package(Tork 0.1 REQUIRED COMPONENTS Common)
find_package(Tork 0.1 REQUIRED COMPONENTS Common Frame)
END
    cp -R "$static" "$work/framework"
    rm -f "$work"/framework/lib/cmake/Tork/VelocorTargets*
    if answer=$(cmake -S "$work/components" -B "$work/components/build" \
        -DCMAKE_PREFIX_PATH="$work/framework" 2>&1) ||
        [[ $answer != *"Velocor::Frame is not installed"* ]]; then
        echo "$answer"
        echo "consumers: FAILED: a missing component is not reported"
        failed=$((failed + 1))
    else
        passed=$((passed + 1))
    fi
}

for compiler in g++-12 clang++-14 clang++-16 clang++-19; do
    if ! command -v "$compiler" >/dev/null; then
        echo "skipped: consumers with $compiler, which is not installed"
        continue
    fi
    for standard in 17 20 23; do
        name=$standard
        # As both called it before it was published.
        [ "$standard" != 23 ] || name=2b
        consumer "$static" tork UsesFramework "$compiler" "-std=c++$name"
    done
    consumer "$shared" velocor-frame UsesFrame "$compiler" -std=c++17 -O2
    for flag in -fvisibility=hidden -fno-rtti -fno-exceptions -D_GLIBCXX_DEBUG -DQT_NO_KEYWORDS; do
        [ "$compiler" = g++-12 ] || continue
        for prefix in "$static" "$shared"; do
            consumer "$prefix" tork UsesFramework "$compiler" -std=c++17 "$flag"
        done
    done
done
components

echo "consumers: $passed work, $failed do not"
[ "$failed" -eq 0 ]
