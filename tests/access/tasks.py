# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
"""What users do with the program, each by AT-SPI alone and by keyboard alone.

    tasks.py PROGRAM (atspi|keyboard) [TASK...]

Needs a display of its own. Each task starts the program again, and its result is read through
AT-SPI, or from files.
"""

import os
import re
import sys

from driver import CHECKED, Failed, desktop, in_own_session, running, wait

LOG = b"".join(
    b"2025-03-03 09:%02d:%02d.000 %s %s\n"
    % (
        i // 60,
        i % 60,
        b"Error" if i in (40, 160) else b"Warning" if i in (20, 90) else b"Trace",
        b"message %d about %s" % (i, b"apples" if i % 10 == 3 else b"pears"),
    )
    for i in range(200)
)
SETTINGS = (
    b"<VelocorSettings>\n<Editor>\n<font>Serif</font>\n<wrap>yes</wrap>\n"
    b"</Editor>\n</VelocorSettings>\n"
)

TASKS = {}


def task(files):
    """Registers a class with the steps of both ways, `atspi` and `keyboard`, and the `check`."""

    def register(cls):
        TASKS[cls.__doc__] = (files, cls)
        return cls

    return register


def opened(run):
    wait("all lines are read", lambda: run.rows() == 200)


def clipboard(run):
    """What has been copied, pasted where it can be read."""
    field = run.find("text", "Filter by text")
    field.ask("EditableText", "SetTextContents", "(s)", "")
    field.ask("EditableText", "PasteText", "(i)", 0)
    return field.text()


@task({"a.log": LOG})
class NextProblem:
    "go to the next problem"

    def atspi(run):
        run.press("push button", "Next Problem")

    def keyboard(run):
        run.keys("F8")

    def check(run):
        wait("a warning or an error", lambda: re.search("message (20|40|90|160) ", run.current()))


@task({"a.log": LOG})
class LastError:
    "find the last error"

    def atspi(run):
        for severity in ("Trace", "Warning"):
            run.press("check box", "Show " + severity)
        wait("two errors", lambda: run.rows() == 2)
        run.press("push button", "Previous Problem")

    def keyboard(run):
        run.keys("ctrl+1", "ctrl+3")
        wait("two errors", lambda: run.rows() == 2)
        run.keys("ctrl+End")

    def check(run):
        wait("the last error", lambda: "message 160 " in run.current())


@task({"a.log": LOG})
class FilterByText:
    "filter by text"

    def atspi(run):
        run.write("Filter by text", "apples")

    def keyboard(run):
        run.keys("ctrl+l")
        run.type("apples")

    def check(run):
        wait("what matches", lambda: run.rows() == 20 and "message 3 about apples" in run.row(0))


@task({"a.log": LOG})
class FilterBySeverity:
    "hide a severity"

    def atspi(run):
        run.press("check box", "Show Trace")

    def keyboard(run):
        run.keys("ctrl+1")

    def check(run):
        wait("four problems", lambda: run.rows() == 4)
        wait("the switch is off", lambda: not run.find("check box", "Show Trace").has(CHECKED))


@task({"a.log": LOG})
class ClearFilter:
    "see all lines again"

    def atspi(run):
        run.write("Filter by text", "apples")
        wait("what matches", lambda: run.rows() == 20)
        run.menu("Edit", "Clear Filter")

    def keyboard(run):
        run.keys("ctrl+l")
        run.type("apples")
        wait("what matches", lambda: run.rows() == 20)
        run.keys("ctrl+shift+f")

    def check(run):
        wait("all lines", lambda: run.rows() == 200)


@task({"a.log": LOG})
class Find:
    "find a text, and the next one"

    def atspi(run):
        run.menu("Edit", "Find")
        run.write("Find text", "apples")
        run.press("push button", "Find next")
        wait("the first", lambda: "apples" in run.current())
        Find.first = run.current()
        run.press("push button", "Find next")

    def keyboard(run):
        run.keys("ctrl+f")
        run.type("apples")
        run.keys("Return")
        wait("the first", lambda: "apples" in run.current())
        Find.first = run.current()
        run.keys("Return")

    def check(run):
        wait("the next", lambda: "apples" in run.current() and run.current() != Find.first)


@task({"a.log": LOG})
class Copy:
    "copy an entry"

    def atspi(run):
        run.menu("Edit", "Go To...")
        run.write("Line or time", "8")
        run.press("push button", "OK")
        wait("the line", lambda: "message 7 " in run.current())
        run.menu("Edit", "Copy")

    def keyboard(run):
        run.keys("ctrl+Home", *["Down"] * 7, "ctrl+c")
        wait("the line", lambda: "message 7 " in run.current())

    def check(run):
        wait("the copy", lambda: "message 7 about pears" in clipboard(run))


@task({"a.log": LOG})
class GoToLine:
    "go to a line by its number"

    def atspi(run):
        run.menu("Edit", "Go To...")
        run.write("Line or time", "124")
        run.press("push button", "OK")

    def keyboard(run):
        run.keys("ctrl+g")
        run.wait_for_focus("Line or time")
        run.type("124")
        run.keys("Return")

    def check(run):
        wait("line 124", lambda: "message 123 " in run.current())


@task({"some.cfg": SETTINGS})
class ChangeValue:
    "change a value, and save it"

    def atspi(run):
        wait("the settings", lambda: run.table("Settings"))
        run.menu("Edit", "Settings File", "Find")
        run.write("Find in names and values", "Serif")
        run.press("push button", "Find next")
        run.menu("Edit", "Settings File", "Edit in Large Field")
        run.write("Value", "Mono")
        run.press("push button", "OK")
        run.gone("push button", "OK")
        run.menu("File", "Save")

    def keyboard(run):
        wait("the settings", lambda: run.table("Settings"))
        run.keys("Home", "Down", "F2")
        run.keys("ctrl+a")
        run.type("Mono")
        run.keys("Return", "ctrl+s")

    def check(run):
        wait("the file", lambda: b"<font>Mono</font>" in run.file("some.cfg"))


def main():
    program, way, *names = sys.argv[1:]
    program = os.path.abspath(program)
    failed = 0
    for name, (files, cls) in TASKS.items():
        if names and name not in names:
            continue
        try:
            with running(program, files) as run:
                if "a.log" in files:
                    opened(run)
                getattr(cls, way)(run)
                cls.check(run)
            print(f"PASS   {way}: {name}", flush=True)
        except Failed as error:
            failed += 1
            print(f"FAIL!  {way}: {name}: {error}", flush=True)
    if failed or (names and not set(names) <= set(TASKS)):
        sys.exit(1)


if __name__ == "__main__":
    in_own_session()
    with desktop():
        main()
