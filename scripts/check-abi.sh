#!/usr/bin/env bash
# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
#
# Compares the binary interface of the shared library with the description stored for its SONAME.
# Fails if a program that was linked with the described library may no longer work with this one.
#
#     scripts/check-abi.sh            compare
#     scripts/check-abi.sh --store    describe the library as it is now
set -euo pipefail
cd "$(dirname "${BASH_SOURCE[0]}")/.."

build=build/abi
descriptions=packaging/abi

# Without optimization the debug information has every type; the paths in it start at the root.
cmake -S . -B "$build" -G Ninja -DCMAKE_BUILD_TYPE=Debug -DBUILD_SHARED_LIBS=ON \
    -DVELOCOR_QT=5 -DVELOCOR_BUILD_TESTS=OFF -DCMAKE_CXX_FLAGS="-ffile-prefix-map=$PWD=."
cmake --build "$build" --target tork_common
cmake --install "$build/common" --prefix "$PWD/$build/prefix" >/dev/null

library=$build/prefix/lib/libtork.so
soname=$(objdump -p "$library" | sed -n 's/^ *SONAME *//p')
machine=$(uname -m)
stored=$descriptions/$soname-$machine.abi
[ -n "$soname" ]

describe() {
    abidw --headers-dir "$build/prefix/include/tork" --drop-private-types --drop-undefined-syms \
        --suppressions "$descriptions/others.suppr" --exported-interfaces-only \
        --no-show-locs --no-corpus-path --no-comp-dir-path --no-elf-needed --no-architecture \
        --no-parameter-names --no-write-default-sizes --type-id-style hash "$library"
}

if [ "${1:-}" = --store ]; then
    mkdir -p "$descriptions"
    describe >"$stored"
    echo "abi: stored $stored"
    exit
fi

if ! compgen -G "$descriptions/*-$machine.abi" >/dev/null; then
    echo "skipped: the binary interface on $machine, of which no description is stored"
    exit
fi
if [ ! -f "$stored" ]; then
    echo "abi: no description of $soname; scripts/check-abi.sh --store makes it"
    exit 1
fi

describe >"$build/now.abi"
if ! abidiff --no-added-syms "$stored" "$build/now.abi"; then
    echo "abi: programs linked with $soname may break. Change it back, or change the SONAME:"
    echo "abi: the minor version in CMakeLists.txt; then scripts/check-abi.sh --store"
    exit 1
fi
additions=$(abidiff "$stored" "$build/now.abi" || true)
if [ -n "$additions" ]; then
    echo "$additions"
    echo "abi: $soname has grown. Commit the new description: scripts/check-abi.sh --store"
    exit 1
fi
echo "abi: $soname is as described, $(grep -c '<elf-symbol ' "$stored") symbols"
