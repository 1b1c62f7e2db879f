#!/usr/bin/env python3
# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
"""Runs tests of a build under valgrind memcheck. Called by scripts/check-memory.sh.

    scripts/memcheck-run.py BUILD-FOLDER SUPPRESSIONS LABEL-PATTERN

Each test is started as CTest would start it, with memcheck in front of the program. A test that
fails because it is slower here counts as failed: no test may depend on time.
"""

import json
import os
import subprocess
import sys
import time
from concurrent.futures import ThreadPoolExecutor

MEMCHECK = [
    "valgrind",
    "--quiet",
    "--error-exitcode=99",
    "--leak-check=full",
    "--show-leak-kinds=definite",
    "--errors-for-leak-kinds=definite",
]


def tests_of(build, labels):
    # Runs of a program in other languages use memory the same way.
    others = "^(memcheck|locale)$"
    listing = subprocess.run(
        ["ctest", "--test-dir", build, "--show-only=json-v1", "-L", labels, "-LE", others],
        check=True,
        capture_output=True,
        text=True,
    )
    return [test for test in json.loads(listing.stdout)["tests"] if "command" in test]


def value_of(test, name):
    return next((each["value"] for each in test["properties"] if each["name"] == name), [])


def run(test, suppressions):
    environment = dict(os.environ)
    environment.update(entry.split("=", 1) for entry in value_of(test, "ENVIRONMENT"))
    command = test["command"]
    program = next(i for i, part in enumerate(command) if os.path.basename(part) == test["name"])
    memcheck = MEMCHECK + [f"--suppressions={suppressions}"]
    started = time.monotonic()
    result = subprocess.run(
        command[:program] + memcheck + command[program:],
        env=environment,
        stdout=subprocess.PIPE,
        stderr=subprocess.STDOUT,
        text=True,
        errors="replace",
    )
    passed = result.returncode == 0
    seconds = time.monotonic() - started
    if not passed:
        print(result.stdout[-20000:])
    print(f"memcheck {test['name']}: {'clean' if passed else 'FAILED'}, {seconds:.0f} s", flush=True)
    return passed


def main():
    build, suppressions, labels = sys.argv[1:]
    tests = tests_of(build, labels)
    with ThreadPoolExecutor(os.cpu_count()) as pool:
        results = list(pool.map(lambda test: run(test, suppressions), tests))
    print(f"memcheck: {results.count(True)} of {len(results)} test programs are clean")
    sys.exit(0 if results and all(results) else 1)


main()
