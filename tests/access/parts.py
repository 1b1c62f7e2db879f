# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
"""Looks at all parts of all views and dialogs, as assistive technology sees them.

    parts.py PROGRAM

Every control has a name, every part a known role, and every target of the mouse is large enough.
Needs a display of its own.
"""

import os
import sys

from driver import ENABLED, LARGE_ROLES, Failed, desktop, in_own_session, running, wait
from tasks import LOG, SETTINGS

CONTROLS = {
    "button menu",
    "check box",
    "combo box",
    "label",
    "menu item",
    "page tab",
    "page tab list",
    "push button",
    "radio button",
    "slider",
    "spin button",
    "table",
    "text",
    "tree",
}
TARGETS = CONTROLS - {"label", "menu bar", "page tab list"}
LEAST = 24  # pixels, in both directions

# What to look at besides the window with its tabs, and how to leave it.
DIALOGS = [
    ("Edit", "Go To..."),
    ("Edit", "Log Settings..."),
    ("View", "All Marks..."),
    ("View", "Note..."),
    ("View", "Highlight Rules..."),
    ("File", "Save Report..."),
    ("Help", "Keyboard Shortcuts"),
    ("Help", "About Velocor"),
]


def problems(part, where):
    role, name = part.role, part.name
    what = f"{where}: {part} in {part.parent()}"
    if part.role_number in (0, 67):
        yield f"unknown role: {what}"
    if role in CONTROLS and not name:
        yield f"no name: {what}"
    if "\t" in name:
        yield f"a key in the name: {what}"
    if role in TARGETS and part.has(ENABLED):
        _, _, width, height = part.rectangle()
        if 0 < min(width, height) < LEAST:
            yield f"{width}x{height}: {what}"


def look(run, where):
    found = []
    for part in run.parts():
        found.extend(problems(part, where))
        if part.role == "menu bar":
            for menu in part.children():
                for entry in menu.children()[0].children():
                    found.extend(problems(entry, f"menu {menu.name}"))
    return found


def main():
    program = os.path.abspath(sys.argv[1])
    found = []
    with running(program, {"a.log": LOG}) as run:
        wait("all lines are read", lambda: run.rows() == 200)
        for entry in (("View", "Next Problem"), ("View", "Mark"), ("Edit", "Find"), ("View", "Places"), ("View", "Analyze", "Activity")):
            run.menu(*entry)
        run.press("check box", "More filters")
        run.find("text", "Find text")
        run.write("Filter by text", "message")
        run.find("text", "Terms that lines also contain")
        found += look(run, "log")
        run.menu("View", "Whole Family, by Time")
        run.find("button menu", "Programs: 2 of 2")
        found += look(run, "family")
        for dialog in DIALOGS:
            run.menu(*dialog)
            wait(dialog[1], lambda: len(run.windows()) > 1)
            found += look(run, dialog[1])
            run.keys("Escape")
            wait(f"{dialog[1]} is closed", lambda: len(run.windows()) == 1)
    with running(program, {"some.cfg": SETTINGS, "broken.cfg": b"<a"}) as run:
        run.find("text", "File text")
        found += look(run, "broken settings")
    with running(program, {"some.cfg": SETTINGS}) as run:
        wait("the settings", lambda: run.table("Settings"))
        run.menu("Edit", "Settings File", "Find")
        run.find("text", "Find in names and values")
        found += look(run, "settings")
    for problem in dict.fromkeys(found):
        print(problem)
    if found:
        sys.exit(1)


in_own_session()
with desktop():
    main()
