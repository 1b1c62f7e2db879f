#!/usr/bin/env bash
# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
#
# Builds programs on the installed package in the ways that other projects build, and runs them: with
# other compilers, standards and flags, against the static and the shared library, with the Qt of the
# package. Each compiler also builds a project that fetches the sources.
#
#     scripts/check-consumers.sh STATIC SHARED     the two prefixes
set -euo pipefail

static=$(realpath "$1")
shared=$(realpath "$2")
cd "$(dirname "${BASH_SOURCE[0]}")/.."

work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
export QT_QPA_PLATFORM=offscreen HOME=$work XDG_DATA_HOME=$work/data

qt=5
suffix=
if [ -e "$static/lib/pkgconfig/tork-qt6.pc" ]; then
    qt=6
    suffix=-qt6
fi

passed=0
failed=0

# verdict STATUS WHAT
verdict() {
    if [ "$1" -eq 0 ]; then
        passed=$((passed + 1))
    else
        echo "consumers: FAILED: $2"
        failed=$((failed + 1))
    fi
}

# consumer PREFIX PACKAGE SOURCE COMPILER FLAG...
consumer() {
    local prefix=$1 package=$2$suffix source=$3 compiler=$4 flags=()
    shift 4
    read -r -a flags < <(PKG_CONFIG_PATH=$prefix/lib/pkgconfig pkg-config --cflags --libs "$package")
    local status=0
    "$compiler" -Wall -Wextra -Werror -DQT_DEPRECATED_WARNINGS_SINCE=0x050900 "$@" \
        "tests/package/$source.cpp" -o "$work/program" "${flags[@]}" "-Wl,-rpath,$prefix/lib" &&
        "$work/program" || status=1
    verdict $status "$compiler $* with $package in ${prefix#"$PWD"/}"
}

# build_project FOLDER BUILD OPTION...
build_project() {
    local status=0 folder=$1 build=$2
    shift 2
    { cmake -G Ninja -S "$folder" -B "$build" "$@" &&
        cmake --build "$build" --parallel 2; } >"$work/output" 2>&1 || status=1
    [ $status -eq 0 ] || tail -n 30 "$work/output"
    return $status
}

# fetched COMPILER STANDARD: this tree within another project, which has found its Qt before.
fetched() {
    local status=0 build=$work/fetched folder=tests/package/subdirectory
    rm -rf "$build"
    build_project $folder "$build" -DVELOCOR_SOURCE_DIR="$PWD" -DPROJECT_QT="$qt" \
        -DCMAKE_CXX_COMPILER="$1" -DCMAKE_CXX_STANDARD="$2" &&
        (cd "$build" && cmake -P "$OLDPWD/$folder/Run.cmake") || status=1
    verdict $status "FetchContent with $1 and C++$2"
}

# exported PREFIX: a library on the package that is installed and exported in turn, and a program on
# that, both as unity builds.
exported() {
    local status=0 folder=$work/exported
    local options=(-DCMAKE_PREFIX_PATH="$1;$folder/prefix" -DCMAKE_UNITY_BUILD=ON
        -DCMAKE_CXX_FLAGS=-DQT_DEPRECATED_WARNINGS_SINCE=0x050900)
    rm -rf "$folder"
    build_project tests/package/exported/library "$folder/library" "${options[@]}" &&
        cmake --install "$folder/library" --prefix "$folder/prefix" >/dev/null &&
        build_project tests/package/exported/program "$folder/program" "${options[@]}" &&
        "$folder/program/program" || status=1
    verdict $status "install(EXPORT) of a library on ${1#"$PWD"/}"
}

other_qt() {
    local status=0
    build_project tests/package/other_qt "$work/other_qt" -DOTHER_QT=$((11 - qt)) \
        -DCMAKE_PREFIX_PATH="$static" || status=1
    if [ $status -eq 0 ] && grep 'is not installed' "$work/output" | sed 's/^-- /skipped: consumers: /'; then
        return
    fi
    verdict $status "a project with Qt $((11 - qt))"
}

# refused WHAT PREFIX LINES ANSWER: a project does not get the package, and learns why.
refused() {
    local what=$1 prefix=$2 lines=$3 expected=$4 answer status=1 folder=$work/refused
    rm -rf "$folder"
    mkdir "$folder"
    cat >"$folder/CMakeLists.txt" <<END
cmake_minimum_required(VERSION 3.16)
project(Refused LANGUAGES CXX)
$lines
END
    # CMake breaks lines where it likes.
    if ! answer=$(cmake -G Ninja -S "$folder" -B "$folder/build" -DCMAKE_PREFIX_PATH="$prefix" 2>&1) &&
        [[ $(tr -s '\n ' ' ' <<<"$answer") == *"$expected"* ]]; then
        status=0
    else
        echo "$answer"
    fi
    verdict $status "find_package() $what"
}

refusals() {
    refused "of a later version" "$static" "find_package(Tork 0.2 REQUIRED)" \
        'compatible with requested version "0.2". The following configuration files were considered'
    refused "of an unknown component" "$static" "find_package(Tork 0.1 REQUIRED COMPONENTS Common Paint)" \
        "There is no component Paint: the components of Tork are Common and Frame."
    refused "without Qt" "$static" "set(CMAKE_FIND_USE_CMAKE_SYSTEM_PATH OFF)
        set(CMAKE_FIND_USE_SYSTEM_ENVIRONMENT_PATH OFF)
        find_package(Tork 0.1 REQUIRED)" "provided by \"Qt$qt\""
    cp -R "$static" "$work/framework"
    rm -f "$work"/framework/lib/cmake/Tork*/VelocorTargets*
    refused "without the frame" "$work/framework" "find_package(Tork 0.1 REQUIRED COMPONENTS Frame)" \
        "Velocor::Frame is not installed in $work/framework"
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
        consumer "$static" tork UsesFramework "$compiler" -std=c++17 "$flag"
        [ "$compiler" != g++-12 ] ||
            consumer "$shared" tork UsesFramework "$compiler" -std=c++17 "$flag"
    done
    fetched "$compiler" 23 # ./test does so with C++20
done
exported "$static"
exported "$shared"
other_qt
refusals

echo "consumers: $passed work with Qt $qt, $failed do not"
[ "$failed" -eq 0 ]
