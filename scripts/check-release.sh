#!/usr/bin/env bash
# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
#
# Builds and installs what users get and starts it, by ./run. The optimizer sees more than a debug
# build, and what it warns about is an error, too.
set -euo pipefail
cd "$(dirname "${BASH_SOURCE[0]}")/.."

fail() {
    echo "check-release: $*" >&2
    exit 1
}

# A user of its own, whose log is looked at below.
home=$(mktemp -d)
trap 'rm -rf "$home"' EXIT
export HOME=$home XDG_RUNTIME_DIR=$home QT_QPA_PLATFORM=offscreen
unset XDG_DATA_HOME XDG_CONFIG_HOME

answer=$(./run --version | tee /dev/stderr | tail -n 1) # which shows what the compiler says, too
[[ $answer =~ ^velocor\ [0-9.]+$ ]] || fail "./run --version printed: $answer"
[ "$(dist/bin/velocor-log --version)" = "velocor-log ${answer#velocor }" ] ||
    fail "velocor-log has another version than $answer"
log=$(find "$home" -path '*/logs/velocor.log')
[ -s "$log" ] || fail "the program has written no log"
grep -q 'app.exec() starting' "$log" || fail "the program did not reach its event loop, see its log"
echo "release: built, installed and started $answer"
