#!/usr/bin/env python3
# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
"""Turns gcovr's table (CSV on standard input) into one line per file and a total.

Fails below 95 % of lines or 90 % of branches.
"""

import csv
import sys

LINES, BRANCHES = 95.0, 90.0


def percent(covered, total):
    return 100.0 * covered / total if total else 100.0


def row(name, line_covered, lines, branch_covered, branches):
    missed = f"{lines - line_covered:6d} {branches - branch_covered:6d}"
    print(
        f"{name:44} {percent(line_covered, lines):6.1f} "
        f"{percent(branch_covered, branches):6.1f} {missed}"
    )


def main():
    files = list(csv.DictReader(sys.stdin))
    columns = ("line_covered", "line_total", "branch_covered", "branch_total")
    print(f"{'file':44} {'lines%':>6} {'brch%':>6} {'missed':>6} {'missed':>6}")
    totals = [0, 0, 0, 0]
    for file in sorted(files, key=lambda each: each["filename"]):
        counts = [int(file[column]) for column in columns]
        row(file["filename"], *counts)
        totals = [total + count for total, count in zip(totals, counts)]
    row("total", *totals)

    lines, branches = percent(*totals[:2]), percent(*totals[2:])
    print(f"coverage: {lines:.1f} % of lines, {branches:.1f} % of branches")
    if lines < LINES or branches < BRANCHES:
        sys.exit(f"coverage: below {LINES:.0f} % of lines or {BRANCHES:.0f} % of branches")


main()
