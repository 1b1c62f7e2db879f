#!/usr/bin/env bash
# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
#
# Compares the binary interface of the shared library, built with Qt 5 and with Qt 6, with the
# description stored for its SONAME.
# Fails if a program that was linked with the described library may no longer work with this one.
#
#     scripts/check-abi.sh            compare
#     scripts/check-abi.sh --store    describe the libraries as they are now
set -euo pipefail
cd "$(dirname "${BASH_SOURCE[0]}")/.."

descriptions=packaging/abi
machine=$(uname -m)

if [ "${1:-}" != --store ] && ! compgen -G "$descriptions/*-$machine.abi" >/dev/null; then
    echo "skipped: the binary interface on $machine, of which no description is stored"
    exit
fi

# build QT: without optimization the debug information has every type; the paths in it start at the
# root.
build() {
    local folder=build/abi/qt$1
    cmake -S . -B "$folder" -G Ninja -DCMAKE_BUILD_TYPE=Debug -DBUILD_SHARED_LIBS=ON \
        -DVELOCOR_QT="$1" -DVELOCOR_BUILD_TESTS=OFF -DCMAKE_CXX_FLAGS="-ffile-prefix-map=$PWD=." \
        -DCMAKE_UNITY_BUILD=ON -DCMAKE_UNITY_BUILD_BATCH_SIZE=0
    cmake --build "$folder" --target tork_common
    cmake --install "$folder/common" --prefix "$PWD/$folder/prefix" >/dev/null
}

# describe LIBRARY
describe() {
    abidw --headers-dir "${1%/lib/*}/include/tork" --drop-private-types --drop-undefined-syms \
        --suppressions "$descriptions/others.suppr" --exported-interfaces-only \
        --no-show-locs --no-corpus-path --no-comp-dir-path --no-elf-needed --no-architecture \
        --no-parameter-names --no-write-default-sizes --type-id-style hash "$1"
}

# compare LIBRARY DESCRIPTION SONAME
compare() {
    local now=$work/now.abi additions
    if [ ! -f "$2" ]; then
        echo "abi: no description of $3; scripts/check-abi.sh --store makes it"
        return 1
    fi
    describe "$1" >"$now" || return 1
    if ! abidiff --no-added-syms "$2" "$now"; then
        echo "abi: programs linked with $3 may break. Change it back, or change the SONAME:"
        echo "abi: the minor version in CMakeLists.txt; then scripts/check-abi.sh --store"
        return 1
    fi
    additions=$(abidiff "$2" "$now" || true)
    if [ -n "$additions" ]; then
        echo "$additions"
        echo "abi: $3 has grown. Commit the new description: scripts/check-abi.sh --store"
        return 1
    fi
    echo "abi: $3 is as described, $(grep -c '<elf-symbol ' "$2") symbols"
}

work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT

failed=0
for qt in 5 6; do
    build $qt
    suffix=
    [ $qt = 5 ] || suffix=-qt$qt
    library=build/abi/qt$qt/prefix/lib/libtork$suffix.so
    soname=$(objdump -p "$library" | sed -n 's/^ *SONAME *//p')
    [ -n "$soname" ]
    stored=$descriptions/$soname-$machine.abi
    if [ "${1:-}" = --store ]; then
        mkdir -p "$descriptions"
        describe "$library" >"$stored"
        echo "abi: stored $stored"
    else
        compare "$library" "$stored" "$soname" || failed=1
    fi
done
exit $failed
