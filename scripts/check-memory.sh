#!/usr/bin/env bash
# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
#
# Runs the log and config tests under valgrind memcheck; every invalid use of memory and every lost
# block fails. Only Qt's own are suppressed. Uses the tests of the preset `coverage`, which ./check has
# already built.
set -euo pipefail

root=$(cd "$(dirname "${BASH_SOURCE[0]}")/.." && pwd -P)

"$root/scripts/install-packages.sh" build test check
"$root/scripts/build.sh" coverage tests/log/all tests/config/all
"$root/scripts/prepare-coverage.sh"

exec "$root/scripts/memcheck-run.py" "$root/build/coverage" "$root/tests/support/qt.supp" \
    '^(log|config)$'
