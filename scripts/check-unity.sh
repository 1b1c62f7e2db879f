#!/usr/bin/env bash
# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
#
# Compiles each library of app/ and common/ as one file. Fails if two of its sources use the same name
# for different things in their unnamed namespaces.
set -euo pipefail
cd "$(dirname "${BASH_SOURCE[0]}")/.."

cmake -S . -B build/unity -G Ninja -DCMAKE_UNITY_BUILD=ON -DCMAKE_UNITY_BUILD_BATCH_SIZE=0 \
    -DVELOCOR_BUILD_TESTS=OFF -DVELOCOR_WERROR=ON
cmake --build build/unity --parallel 2
echo "unity: each library compiles as one file"
