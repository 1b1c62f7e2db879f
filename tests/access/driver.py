# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
"""The program as assistive technology sees it, and a keyboard.

Reads and operates everything through AT-SPI; xdotool presses keys. Nothing here knows how the
program is made.
"""

import contextlib
import os
import signal
import subprocess
import sys
import tempfile
import time

from gi.repository import Gio, GLib

PATIENCE = 30  # seconds, for a crowded machine

# The bits of states that are used here.
ACTIVE, CHECKED, ENABLED, FOCUSABLE, FOCUSED, SELECTED, SHOWING = 1, 4, 8, 11, 12, 23, 25

# What would have thousands of children.
LARGE_ROLES = {"table", "tree", "tree table", "list", "text"}


class Failed(Exception):
    """What a user would have complained about."""


def wait(what, condition, patience=None):
    """Waits until a condition holds, and returns its result."""
    end = time.monotonic() + (patience or PATIENCE)
    while True:
        while GLib.MainContext.default().iteration(False):
            pass
        try:
            result = condition()
        except GLib.Error:  # it has gone meanwhile
            result = None
        if result:
            return result
        if time.monotonic() > end:
            raise Failed(f"waited in vain: {what}")
        time.sleep(0.02)


def ask(connection, service, path, interface, method, arguments=None):
    result = connection.call_sync(
        service, path, interface, method, arguments, None, Gio.DBusCallFlags.NONE, 60000, None
    )
    values = result.unpack()
    return values[0] if len(values) == 1 else values


class Part:
    """An accessible object. Everything is asked again, nothing is remembered."""

    bus = None  # the accessibility bus

    def __init__(self, service, path):
        self.service = service
        self.path = path

    def __eq__(self, other):
        return (self.service, self.path) == (other.service, other.path)

    def ask(self, interface, method, signature="()", *arguments):
        return ask(
            self.bus,
            self.service,
            self.path,
            "org.a11y.atspi." + interface,
            method,
            GLib.Variant(signature, arguments),
        )

    def get(self, interface, name):
        return ask(
            self.bus,
            self.service,
            self.path,
            "org.freedesktop.DBus.Properties",
            "Get",
            GLib.Variant("(ss)", ("org.a11y.atspi." + interface, name)),
        )

    @property
    def name(self):
        return self.get("Accessible", "Name")

    @property
    def description(self):
        return self.get("Accessible", "Description")

    @property
    def role(self):
        return self.ask("Accessible", "GetRoleName")

    @property
    def role_number(self):
        """0 is an invalid role, 67 an unknown one."""
        return self.ask("Accessible", "GetRole")

    def has(self, state):
        low, high = self.ask("Accessible", "GetState")
        return bool((high << 32 | low) >> state & 1)

    def parent(self):
        return Part(*self.get("Accessible", "Parent"))

    def children(self):
        return [
            Part(*child)
            for child in self.ask("Accessible", "GetChildren")
            if child[1] != "/org/a11y/atspi/null"
        ]

    def walk(self):
        """This part and all parts in it that are shown, but not the cells of a table."""
        yield self
        if self.role in LARGE_ROLES:
            return
        for child in self.children():
            try:
                if child.has(SHOWING):
                    yield from child.walk()
            except GLib.Error:  # it has gone meanwhile
                pass

    def rectangle(self):
        """Left, top, width and height on the screen."""
        return self.ask("Component", "GetExtents", "(u)", 0)

    def text(self):
        return self.ask("Text", "GetText", "(ii)", 0, self.get("Text", "CharacterCount"))

    def actions(self):
        return [action[0] for action in self.ask("Action", "GetActions")]

    def act(self, action=None):
        """Does what a click on the part does, or another of its actions."""
        names = self.actions()
        wanted = action or next((n for n in ("Press", "Toggle", "ShowMenu") if n in names), None)
        if wanted not in names:
            raise Failed(f"{self} can only {names}")
        # Nobody waits for the answer, which comes only when a dialog that this opens is closed.
        message = Gio.DBusMessage.new_method_call(
            self.service, self.path, "org.a11y.atspi.Action", "DoAction"
        )
        message.set_body(GLib.Variant("(i)", (names.index(wanted),)))
        message.set_flags(Gio.DBusMessageFlags.NO_REPLY_EXPECTED)
        self.bus.send_message(message, Gio.DBusSendMessageFlags.NONE)

    def focus(self):
        self.act("SetFocus")

    def __str__(self):
        return f"{self.role} {self.name!r}"


def in_own_session():
    """Runs this script again in a session bus of its own, unless it does already."""
    if os.environ.get("VELOCOR_OWN_SESSION"):
        return
    # Not in the build folder: the name of a socket must be short.
    with tempfile.TemporaryDirectory() as folder:
        environment = dict(os.environ, XDG_RUNTIME_DIR=folder, VELOCOR_OWN_SESSION="1")
        for inherited in ("AT_SPI_BUS_ADDRESS", "DBUS_SESSION_BUS_ADDRESS"):
            environment.pop(inherited, None)
        command = ["dbus-run-session", "--", sys.executable, "-B", *sys.argv]
        sys.exit(subprocess.run(command, env=environment, check=False).returncode)


@contextlib.contextmanager
def desktop():
    """What programs find on a desktop: the accessibility bus, and a window manager."""
    # The first question to the bus starts it and the registry of programs. A program that starts in
    # the meantime would not be listed.
    session = Gio.bus_get_sync(Gio.BusType.SESSION)
    address = ask(session, "org.a11y.Bus", "/org/a11y/bus", "org.a11y.Bus", "GetAddress")
    Part.bus = Gio.DBusConnection.new_for_address_sync(
        address,
        Gio.DBusConnectionFlags.AUTHENTICATION_CLIENT
        | Gio.DBusConnectionFlags.MESSAGE_BUS_CONNECTION,
        None,
        None,
    )
    wait("the registry", lambda: REGISTRY.role)
    manager = subprocess.Popen(["openbox", "--sm-disable"], stdout=subprocess.DEVNULL, stderr=subprocess.DEVNULL)
    try:
        wait(
            "the window manager",
            lambda: subprocess.run(
                ["xdotool", "get_num_desktops"],
                stdout=subprocess.DEVNULL,
                stderr=subprocess.DEVNULL,
                check=False,
            ).returncode
            == 0,
        )
        yield
    finally:
        manager.terminate()
        manager.wait()


REGISTRY = Part("org.a11y.atspi.Registry", "/org/a11y/atspi/accessible/root")
REGISTRY_OF_EVENTS = Part("org.a11y.atspi.Registry", "/org/a11y/atspi/registry")


class News:
    """Changes of descriptions, which screen readers announce."""

    def __init__(self):
        self.changes = []
        REGISTRY_OF_EVENTS.ask(
            "Registry",
            "RegisterEvent",
            "(sass)",
            "object:property-change:accessible-description",
            [],
            "",
        )
        Part.bus.signal_subscribe(
            None,
            "org.a11y.atspi.Event.Object",
            "PropertyChange",
            None,
            "accessible-description",
            Gio.DBusSignalFlags.NONE,
            self.take,
        )

    def take(self, _connection, service, path, _interface, _signal, values):
        self.changes.append((Part(service, path), values.unpack()))

    def forget(self):
        self.changes.clear()

    def of(self, name, known=None):
        """What the next part of this name announces, other than what is known: that may be late."""

        def said():
            for part, _ in self.changes:
                if part.name == name and part.description not in ("", known):
                    return part.description
            return None

        return wait(f"{name!r} says something", said)


def bus_call(method, *arguments):
    name = "org.freedesktop.DBus"
    variant = GLib.Variant("(s)", arguments) if arguments else None
    return ask(Part.bus, name, "/org/freedesktop/DBus", name, method, variant)


def service_of(process):
    """The name of a process on the accessibility bus, or None."""
    for service in bus_call("ListNames"):
        with contextlib.suppress(GLib.Error):  # it has gone meanwhile
            if bus_call("GetConnectionUnixProcessID", service) == process:
                return service
    return None


@contextlib.contextmanager
def busy_processors():
    loops = [subprocess.Popen(["sh", "-c", "while :; do :; done"]) for _ in range(os.cpu_count())]
    try:
        yield
    finally:
        for loop in loops:
            loop.kill()
            loop.wait()


class Program:
    """One run of the program, with a home folder of its own."""

    def __init__(self, program, folder, files):
        self.folder = folder
        home = os.path.join(folder, "home")
        environment = dict(
            os.environ,
            HOME=home,
            XDG_DATA_HOME=os.path.join(home, "data"),
            XDG_CONFIG_HOME=os.path.join(home, "config"),
            QT_LINUX_ACCESSIBILITY_ALWAYS_ON="1",
            QT_QPA_PLATFORM="xcb",
        )
        os.makedirs(home, exist_ok=True)
        # Qt 5.15 loses a race in many starts: it connects to the accessibility bus, but never
        # registers there, so that nobody can find the program. Then only another start helps, most
        # of all while the machine is busy.
        for attempt in range(60):
            with busy_processors():
                self.process = subprocess.Popen([program, *files], env=environment, cwd=folder)
                service = wait("being on the accessibility bus", lambda: service_of(self.process.pid))
                self.application = Part(service, "/org/a11y/atspi/accessible/root")
                with contextlib.suppress(Failed):
                    wait("being registered", lambda: self.application in REGISTRY.children(), 0.3 + attempt / 20)
                    break
            self.process.terminate()
            self.process.wait()
        else:
            raise Failed("the program is never registered")
        try:
            wait("an active window", lambda: any(w.has(ACTIVE) for w in self.windows()))
        except BaseException:
            self.process.kill()
            self.process.wait()
            raise

    def end(self):
        """Ends the program as a session manager does, and returns its exit code."""
        if self.process.poll() is None:
            self.process.send_signal(signal.SIGTERM)
        try:
            return self.process.wait(PATIENCE)
        except subprocess.TimeoutExpired:
            self.process.kill()
            self.process.wait()
            raise Failed("the program does not end") from None

    def windows(self):
        return [window for window in self.application.children() if window.has(SHOWING)]

    def parts(self):
        for window in self.windows():
            yield from window.walk()

    def shown(self, role, name):
        """A part by what a screen reader calls it, or None."""
        return next((p for p in self.parts() if p.role == role and p.name == name), None)

    def find(self, role, name):
        return wait(f"{role} {name!r}", lambda: self.shown(role, name))

    def gone(self, role, name):
        wait(f"no {role} {name!r}", lambda: not self.shown(role, name))

    # By AT-SPI alone.

    def press(self, role, name):
        self.find(role, name).act()

    def entry(self, *names):
        """An entry of the menus, which need not be open for this."""
        part = self.find("menu bar", "Menus")
        for name in names:
            entries = part.children()
            if entries and entries[0].role == "popup menu":
                entries = entries[0].children()
            part = next((e for e in entries if e.name == name), None)
            if part is None:
                raise Failed(f"no {name!r} among {[entry.name for entry in entries]}")
        return part

    def menu(self, *names):
        """Chooses from the menus."""
        self.entry(*names).act()

    def write(self, name, text):
        field = self.find("text", name)
        if not field.ask("EditableText", "SetTextContents", "(s)", text):
            raise Failed(f"{name!r} takes no text")

    # By keyboard alone.

    def keys(self, *keys):
        subprocess.run(["xdotool", "key", "--delay", "20", *keys], check=True)

    def type(self, text):
        subprocess.run(["xdotool", "type", "--delay", "15", text], check=True)

    # What a user is told.

    def focused(self):
        """The parts that have the keyboard focus: a tab keeps it beside what it contains."""
        return [part for part in self.parts() if part.has(FOCUSED)]

    def wait_for_focus(self, name):
        wait(f"focus on {name!r}", lambda: any(part.name == name for part in self.focused()))

    def table(self, name="Log entries"):
        return next((p for p in self.parts() if p.role in LARGE_ROLES and p.name == name), None)

    def rows(self, name="Log entries"):
        table = self.table(name)
        return table and table.get("Table", "NRows")

    def cell(self, row, column, name="Log entries"):
        return Part(*self.table(name).ask("Table", "GetAccessibleAt", "(ii)", row, column))

    def row(self, row, name="Log entries"):
        """What a screen reader says for a row, without columns that are hidden."""
        columns = self.table(name).get("Table", "NColumns")
        cells = (self.cell(row, column, name) for column in range(columns))
        return " ".join(cell.name for cell in cells if cell.rectangle()[2] and cell.name)

    def parts_of(self, name):
        """All cells and other children of a table, which is short."""
        return self.table(name).children()

    def file(self, name):
        """What is in a file of the folder; nothing if it does not exist."""
        try:
            with open(os.path.join(self.folder, name), "rb") as file:
                return file.read()
        except FileNotFoundError:
            return b""

    def current(self):
        """The whole current line, as the pane below the table has it."""
        return self.find("text", "Full text of the current line").text()


@contextlib.contextmanager
def running(program, files):
    """Runs the program with files that are written to a new folder: names and bytes.

    Those whose names end in .1 are only written.
    """
    with tempfile.TemporaryDirectory() as folder:
        for name, content in files.items():
            with open(os.path.join(folder, name), "wb") as file:
                file.write(content)
        run = Program(program, folder, [name for name in files if not name.endswith(".1")])
        try:
            yield run
        except BaseException:
            with contextlib.suppress(Exception):
                print("focus:", *run.focused(), sep="\n    ")
            run.process.kill()
            run.process.wait()
            raise
        if run.end() != 0:
            raise Failed(f"exit code {run.process.returncode}")
