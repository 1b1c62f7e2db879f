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

from driver import desktop, in_own_session, running, wait
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


def log(program):
    # The program first: while Orca is running, Qt 5.15 hardly ever registers; see driver.Program.
    with running(program, {"a.log": LOG}) as run, listening() as orca:
        wait("all lines are read", lambda: run.rows() == 200)
        run.keys("Up")
        yield orca, "a row", "2025-03-03 09:03:19.000. Trace. message 199 about pears."
        with open(os.path.join(run.folder, "a.log"), "ab") as file:
            file.write(b"2025-03-03 09:04:00.000 Error the disk is full\n")
        yield orca, "a new problem", "1 new problem: the disk is full"
        run.keys("ctrl+f")
        run.type("apples")
        run.keys("Return")
        yield orca, "a line found", "notification message 3 about apples."
        run.keys("ctrl+f")
        run.type("oranges")
        run.keys("Return")
        yield orca, "nothing found", "Not found"


def settings(program):
    with running(program, {"some.cfg": SETTINGS}) as run, listening() as orca:
        wait("the settings", lambda: run.table("Settings"))
        run.keys("Home", "Down")
        yield orca, "a key", "font. Serif."
        run.keys("shift+F2")
        yield orca, "its name", "font"
        run.keys("ctrl+a")
        run.type("wrap")
        yield orca, "a name in use", 'There is already a "wrap" here'


def main():
    program = os.path.abspath(sys.argv[1])
    for part in (log, settings):
        for orca, what, expected in part(program):
            try:
                wait(what, lambda: expected in orca.said())
            finally:
                print(f"{what}: {orca.said()!r}", flush=True)
            orca.forget()


in_own_session()
with desktop():
    main()
