# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
"""What a screen reader says, as the texts that it gets.

    said.py PROGRAM

Needs a display of its own.
"""

import os
import sys

from driver import News, desktop, in_own_session, running, wait
from tasks import LOG, SETTINGS


def rows(program, news):
    with running(program, {"a.log": LOG}) as run:
        wait("all lines are read", lambda: run.rows() == 200)
        yield "a row", run.row(20), "2025-03-03 09:00:20.000 Warning message 20 about pears"
        yield "the table", run.table().description, "200 lines  ·  4 problems"
        run.write("Filter by text", "apples")
        wait("what matches", lambda: run.rows() == 20)
        yield "some rows", run.table().description, "20 of 200 lines  ·  0 problems"
        run.write("Filter by text", "oranges")
        wait("what matches", lambda: run.rows() == 0)
        nothing = "No lines match the filter.\nClear it with Ctrl+Shift+F."
        yield "no rows", run.table().description, nothing


def hit(program, news):
    with running(program, {"a.log": LOG}) as run:
        wait("all lines are read", lambda: run.rows() == 200)
        run.menu("Edit", "Find")
        run.write("Find text", "apples")
        wait("all are found", lambda: run.find("label", "Lines found").description)
        news.forget()
        run.press("push button", "Find next")
        yield "a line found", news.of("Lines found"), "20 of 20"  # it is shown at its end


def problem(program, news):
    with running(program, {"a.log": LOG}) as run:
        wait("all lines are read", lambda: run.rows() == 200)
        known = run.table().description
        news.forget()
        with open(os.path.join(run.folder, "a.log"), "ab") as log:
            log.write(b"2025-03-03 09:04:00.000 Error the disk is full\n")
        yield "a new problem", news.of("Lines shown", known), "201 lines  ·  5 problems"
        yield "its row", run.row(200), "2025-03-03 09:04:00.000 Error the disk is full"


def problem_below_repeats(program, _news):
    with running(program, {"a.log": LOG}) as run:
        wait("all lines are read", lambda: run.rows() == 200)
        run.keys("ctrl+alt+r")
        wait("repeats are folded", lambda: run.rows() < 200)
        with open(os.path.join(run.folder, "a.log"), "ab") as log:
            log.write(b"2025-03-03 09:04:00.000 Error the disk is full\n")

        def notified():  # it never shows
            parts = (part for window in run.windows() for part in window.children())
            return next((part.name for part in parts if part.role == "notification"), None)

        said = wait("a notification", notified)
        yield "a new problem below repeats", said, "1 new problem: the disk is full"


def settings(program, news):
    with running(program, {"some.cfg": SETTINGS}) as run:
        wait("the settings", lambda: run.table("Settings"))
        run.keys("Home", "Down", "shift+F2", "ctrl+a")
        news.forget()
        run.type("wrap")
        yield "a name in use", news.of("Name"), 'There is already a "wrap" here'


def main():
    program = os.path.abspath(sys.argv[1])
    news = News()
    failed = False
    for part in (rows, hit, problem, problem_below_repeats, settings):
        for what, said, expected in part(program, news):
            print(f"{'PASS  ' if said == expected else 'FAIL! '} {what}: {said!r}", flush=True)
            failed = failed or said != expected
    if failed:
        sys.exit(1)


in_own_session()
with desktop():
    main()
