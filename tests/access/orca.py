# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
"""What Orca says, in the log of its speech.

    orca.py PROGRAM

Needs a display of its own. Nobody needs to hear anything: without a speech server, Orca still logs
what it would say.
"""

import contextlib
import os
import re
import subprocess
import sys
import tempfile

from driver import Failed, desktop, in_own_session, running, wait
from tasks import LOG, SETTINGS


class Orca:
    def __init__(self, folder):
        self.log = os.path.join(folder, "speech")
        self.start = 0
        environment = dict(os.environ, HOME=folder, XDG_DATA_HOME=folder)
        for place in ("XDG_CONFIG_HOME", "XDG_CACHE_HOME"):
            environment[place] = os.path.join(folder, place)
        # Not the option for a log, which would keep the last lines back.
        os.mkdir(os.path.join(folder, "orca"))
        with open(os.path.join(folder, "orca", "orca-customizations.py"), "w", encoding="utf-8") as custom:
            custom.write(
                "import orca.debug\n"
                "orca.debug.debugLevel = orca.debug.LEVEL_INFO\n"
                f"orca.debug.debugFile = open({self.log!r}, 'w', buffering=1, encoding='utf-8')\n"
            )
        self.process = subprocess.Popen(
            ["orca", "--replace"],
            env=environment,
            stdout=subprocess.DEVNULL,
            stderr=subprocess.DEVNULL,
        )
        wait("Orca", lambda: "Screen reader on." in self.said())

    def lines(self):
        with contextlib.suppress(FileNotFoundError), open(self.log, encoding="utf-8", errors="replace") as log:
            return re.findall(r"SPEECH OUTPUT: '(.*?)'[\[{]", log.read())
        return []

    def said(self):
        """Everything since forget(), as one text."""
        return " ".join(line.strip() for line in self.lines()[self.start :])

    def forget(self):
        self.start = len(self.lines())


@contextlib.contextmanager
def listening():
    with tempfile.TemporaryDirectory() as folder:
        orca = Orca(folder)
        try:
            yield orca
        finally:
            orca.process.kill()
            orca.process.wait()


def hear(orca, what, act, expected):
    """Does something until Orca says what is expected: it leaves out what it is too busy for."""
    for _ in range(8):
        orca.forget()
        act()
        with contextlib.suppress(Failed):
            wait(what, lambda: expected in orca.said(), 5)
            break
    print(f"{what}: {orca.said()!r}", flush=True)
    if expected not in orca.said():
        raise Failed(f"{expected!r} is not said")


def log(program):
    # The program first: while Orca is running, Qt 5.15 hardly ever registers; see driver.Program.
    with running(program, {"a.log": LOG}) as run, listening() as orca:
        wait("all lines are read", lambda: run.rows() == 200)

        def append():
            with open(os.path.join(run.folder, "a.log"), "ab") as file:
                file.write(b"2025-03-03 09:04:00.000 Error the disk is full\n")

        def find(text):
            run.keys("ctrl+f")
            run.type(text)
            run.keys("Return")

        row = "2025-03-03 09:00:01.000. Trace. message 1 about pears."
        hear(orca, "a row", lambda: run.keys("Home", "Down"), row)
        hear(orca, "a new problem", append, "notification 1 new problem: the disk is full.")
        hear(orca, "a line found", lambda: find("apples"), "about apples.")
        hear(orca, "nothing found", lambda: find("oranges"), "notification Not found.")


def settings(program):
    with running(program, {"some.cfg": SETTINGS}) as run, listening() as orca:
        wait("the settings", lambda: run.table("Settings"))

        def rename():
            run.keys("Escape", "Home", "Down", "shift+F2", "ctrl+a")
            run.type("wrap")

        hear(orca, "a key", lambda: run.keys("Home", "Down"), "font. Serif.")
        problem = 'notification There is already a "wrap" here.'
        hear(orca, "a name in use", rename, problem)


def main():
    program = os.path.abspath(sys.argv[1])
    log(program)
    settings(program)


in_own_session()
with desktop():
    main()
