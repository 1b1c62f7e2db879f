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


@task({"a.log": LOG})
class PreviousProblem:
    "go to the problem before"

    def atspi(run):
        run.press("push button", "Previous Problem")
        wait("the last", lambda: "message 160 " in run.current())
        run.press("push button", "Previous Problem")

    def keyboard(run):
        run.keys("shift+F8")
        wait("the last", lambda: "message 160 " in run.current())
        run.keys("shift+F8")

    def check(run):
        wait("the one before", lambda: "message 90 " in run.current())


@task({"a.log": LOG})
class GoToTime:
    "go to a time"

    def atspi(run):
        run.menu("Edit", "Go To...")
        run.write("Line or time", "09:02")
        run.press("push button", "OK")

    def keyboard(run):
        run.keys("ctrl+g")
        run.wait_for_focus("Line or time")
        run.type("09:02")
        run.keys("Return")

    def check(run):
        wait("the entry of that time", lambda: "message 120 " in run.current())


@task({"a.log": LOG})
class HideLines:
    "hide lines with a text"

    def atspi(run):
        run.press("check box", "More filters")
        run.write("Terms of lines to hide", "pears")

    def keyboard(run):
        run.keys("ctrl+shift+k")
        run.wait_for_focus("Terms of lines to hide")
        run.type("pears")

    def check(run):
        wait("what is left", lambda: run.rows() == 20 and "apples" in run.row(0))


@task({"a.log": LOG})
class SelectAll:
    "copy all lines that are shown"

    def atspi(run):
        run.write("Filter by text", "apples")
        wait("what matches", lambda: run.rows() == 20)
        run.menu("Edit", "Select All")
        run.menu("Edit", "Copy")

    def keyboard(run):
        run.keys("ctrl+l")
        run.type("apples")
        wait("what matches", lambda: run.rows() == 20)
        run.keys("Escape", "ctrl+a", "ctrl+c")

    def check(run):
        wait("the copy", lambda: clipboard(run).count("apples") == 20)


@task({"a.log": LOG})
class Mark:
    "mark a line, and come back to it"

    def atspi(run):
        run.press("push button", "Previous Problem")
        wait("the line", lambda: "message 160 " in run.current())
        run.menu("View", "Mark")
        run.press("push button", "Previous Problem")
        wait("another line", lambda: "message 90 " in run.current())
        run.menu("View", "Next Mark")

    def keyboard(run):
        run.keys("shift+F8", "ctrl+m", "shift+F8")
        wait("another line", lambda: "message 90 " in run.current())
        run.keys("F2")

    def check(run):
        wait("the marked line", lambda: "message 160 " in run.current())
        wait("it says so", lambda: run.row(160).startswith("Marked: "))


@task({"a.log": LOG})
class Note:
    "write a note on a line"

    def atspi(run):
        run.press("push button", "Previous Problem")
        wait("the line", lambda: "message 160 " in run.current())
        run.menu("View", "Note...")
        run.write("Note", "disk")
        run.press("push button", "OK")

    def keyboard(run):
        run.keys("shift+F8")
        wait("the line", lambda: "message 160 " in run.current())
        run.keys("ctrl+shift+m")
        run.wait_for_focus("Note")
        run.type("disk")
        run.keys("Return")

    def check(run):
        note = "Note on the current line"
        wait("the note", lambda: "disk" in run.find("label", note).description)


@task({"a.log": LOG})
class Pause:
    "stop the view while logging continues"

    def atspi(run):
        run.press("check box", "Pause")

    def keyboard(run):
        run.keys("ctrl+shift+p")

    def check(run):
        wait("the switch is on", lambda: run.find("check box", "Pause").has(CHECKED))


@task({"a.log": LOG})
class Places:
    "see where the program keeps its files"

    def atspi(run):
        run.press("check box", "Places")

    def keyboard(run):
        run.keys("F9")

    def check(run):
        run.find("push button", "Copy: Organization")


@task({"a.log": LOG, "a.log.1": LOG.replace(b"2025-03-03", b"2025-03-02")})
class AllFiles:
    "see all files of a log by time"

    def atspi(run):
        run.menu("View", "All Files, by Time")

    def keyboard(run):
        run.keys("ctrl+shift+a")

    def check(run):
        wait("both runs and their headings", lambda: run.rows() == 402)


@task({"a.log": LOG})
class CloseTab:
    "close a file"

    def atspi(run):
        run.menu("File", "Close Tab")

    def keyboard(run):
        run.keys("ctrl+w")

    def check(run):
        run.gone("page tab", "a.log")
        run.keys("ctrl+Home")
        wait("work goes on in the program's log", lambda: "Trace" in run.current())


@task({"a.log": LOG})
class Shortcuts:
    "read the keyboard shortcuts"

    def atspi(run):
        run.menu("Help", "Keyboard Shortcuts")

    def keyboard(run):
        run.keys("ctrl+F1")

    def check(run):
        wait("the list", lambda: "Ctrl+L" in run.find("text", "Keyboard Shortcuts").text())
        run.keys("Escape")


@task({"some.cfg": SETTINGS})
class UndoChange:
    "undo a change of a setting"

    def atspi(run):
        ChangeValue.atspi(run)
        ChangeValue.check(run)
        run.press("push button", "Close the find bar")
        run.menu("Edit", "Undo Change Value")
        run.menu("File", "Save")

    def keyboard(run):
        ChangeValue.keyboard(run)
        ChangeValue.check(run)
        run.keys("ctrl+z", "ctrl+s")

    def check(run):
        wait("the value as before", lambda: b"<font>Serif</font>" in run.file("some.cfg"))


@task({"a.log": LOG})
class Wrap:
    "see all of long messages"

    def atspi(run):
        run.menu("View", "Text", "Line Wrap")

    def keyboard(run):
        run.keys("ctrl+alt+w")

    def check(run):
        wait("the switch is on", lambda: run.entry("View", "Text", "Line Wrap").has(CHECKED))


@task({"a.log": LOG})
class LargerText:
    "read larger text"

    def height(run):
        return run.cell(199, 0).rectangle()[3]

    def atspi(run):
        LargerText.before = LargerText.height(run)
        for _ in range(3):
            run.menu("View", "Text", "Larger")

    def keyboard(run):
        LargerText.before = LargerText.height(run)
        run.keys("ctrl+plus", "ctrl+plus", "ctrl+plus")

    def check(run):
        wait("higher rows", lambda: LargerText.height(run) > LargerText.before)


@task({"a.log": LOG})
class Activity:
    "see when the log was busy"

    def atspi(run):
        run.menu("View", "Analyze", "Activity")

    def keyboard(run):
        run.keys("ctrl+alt+a")

    def check(run):
        run.find("filler", "Activity")


@task({"a.log": LOG})
class SaveLines:
    "save the lines that match"

    def atspi(run):
        run.write("Filter by text", "apples")
        wait("what matches", lambda: run.rows() == 20)
        run.menu("File", "Save Lines As...")
        run.write("File name:", "some.txt")
        run.press("push button", "Save")

    def keyboard(run):
        run.keys("ctrl+l")
        run.type("apples")
        wait("what matches", lambda: run.rows() == 20)
        run.keys("ctrl+shift+s")
        run.find("push button", "Save")
        run.keys("ctrl+a")
        run.type("some.txt")
        run.keys("Return")

    def check(run):
        wait("the file", lambda: run.file("some.txt").count(b"apples") == 20)


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
