#!/usr/bin/env bash
# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
#
# Installs the libraries for Qt 5 and for Qt 6 into one prefix, and builds and runs programs on each.
# Needs the target velocor_frame in both builds.
#
#     scripts/check-both-qts.sh build/dev build/qt6
set -euo pipefail

builds=("$(realpath "$1")" "$(realpath "$2")")
cd "$(dirname "${BASH_SOURCE[0]}")/.."

work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
export QT_QPA_PLATFORM=offscreen HOME=$work XDG_DATA_HOME=$work/data XDG_RUNTIME_DIR=$work
prefix=$work/prefix

fail() {
    echo "both: $*"
    exit 1
}

# install_from BUILD PREFIX
install_from() {
    cmake --install "$1/common" --prefix "$2" >/dev/null
    cmake --install "$1/app" --component frame --prefix "$2" >/dev/null
}

for build in "${builds[@]}"; do
    install_from "$build" "$prefix"
done
# What the second one replaced.
install_from "${builds[0]}" "$work/first"
(cd "$work/first" && find . -type f) | while read -r file; do
    cmp "$work/first/$file" "$prefix/$file" || fail "the libraries overwrite each other's $file"
done

# project NAME FIRST EXPECTED: a project that finds FIRST and then Tork gets the one for Qt EXPECTED.
project() {
    local folder=$work/$1
    mkdir "$folder"
    cat >"$folder/CMakeLists.txt" <<END
cmake_minimum_required(VERSION 3.16)
project(Both LANGUAGES CXX)
$2
find_package(Tork 0.1 REQUIRED COMPONENTS Frame)
if(NOT Tork_QT_VERSION_MAJOR EQUAL $3)
    message(FATAL_ERROR "Qt \${Tork_QT_VERSION_MAJOR}")
endif()
add_executable(program "$PWD/tests/package/UsesFrame.cpp")
target_compile_definitions(program PRIVATE QT_DEPRECATED_WARNINGS_SINCE=0x050900)
target_link_libraries(program PRIVATE Velocor::Frame)
END
    if ! { cmake -G Ninja -S "$folder" -B "$folder/build" -DCMAKE_PREFIX_PATH="$prefix" &&
        cmake --build "$folder/build"; } >"$folder/output" 2>&1; then
        cat "$folder/output"
        fail "a project with $1 does not get the library for Qt $3"
    fi
    "$folder/build/program" || fail "a program with $1 fails"
}
project "Qt 5" "find_package(Qt5 REQUIRED COMPONENTS Core)" 5
project "Qt 6" "find_package(Qt6 REQUIRED COMPONENTS Core)" 6
project "no Qt of its own" "" 5

for package in velocor-frame velocor-frame-qt6; do
    read -r -a flags < <(PKG_CONFIG_PATH=$prefix/lib/pkgconfig pkg-config --cflags --libs $package)
    c++ -std=c++17 -DQT_DEPRECATED_WARNINGS_SINCE=0x050900 tests/package/UsesFrame.cpp \
        -o "$work/program" "${flags[@]}" || fail "$package"
    "$work/program" || fail "a program with $package fails"
done
echo "both: 5 programs with the libraries for Qt 5 and Qt 6 in one prefix"
