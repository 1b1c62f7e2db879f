# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
"""Runs the tests that mutants.py has built: which mutants they reach, and which they notice."""
import collections
import concurrent.futures
import contextlib
import hashlib
import json
import os
import pathlib
import queue
import re
import shutil
import signal
import subprocess
import time

from mutant_build import NUMBERS, WORK, digest, run, targets

LEFT_OUT = r"locale|package|memcheck"  # labels; and runs of the same tests on other screens:
OTHER_SCREENS = "800x600|double_scale"
NOTICED = collections.Counter()


def tests(build, pattern):
    """The tests of a build whose path or name matches: name, program and environment."""
    listed = run("ctest", "--test-dir", WORK / build, "--show-only=json-v1", "-LE", LEFT_OUT, "-E", OTHER_SCREENS,
                 capture_output=True).stdout
    found = {}
    for test in json.loads(listed)["tests"]:
        properties = {p["name"]: p["value"] for p in test["properties"]}
        variables = dict(v.split("=", 1) for v in properties.get("ENVIRONMENT", []))
        program = test.get("command", ["-"])[-1]
        if test["name"].startswith("tst_") and re.search(f"/({pattern})", program) and os.path.exists(program):
            found[test["name"]] = (program, variables)
    return found


class Desk:
    """Where one test runs at a time: its own home and temporary folder, and its own display."""

    def __init__(self, number):
        self.folder = WORK / f"desk{number}"
        reading, writing = os.pipe()
        self.server = subprocess.Popen(
            ["Xvfb", "-displayfd", str(writing), "-screen", "0", "1920x1080x24", "-nolisten", "tcp"],
            pass_fds=[writing], stderr=subprocess.DEVNULL)
        os.close(writing)
        with os.fdopen(reading) as pipe:
            self.display = ":" + pipe.readline().strip()

    def clear(self):
        """Removes what the last test left; one that was killed may have left file systems mounted."""
        mounted = [line.split()[1] for line in pathlib.Path("/proc/self/mounts").read_text().splitlines()]
        for place in mounted:
            if place.startswith(f"{self.folder}/"):
                subprocess.run(["umount", place], stderr=subprocess.DEVNULL)
        shutil.rmtree(self.folder, ignore_errors=True)

    def run(self, test, functions, limit, **more):
        """Runs functions of a test until one fails; returns why it failed, or nothing."""
        program, variables = test
        self.clear()
        (self.folder / "tmp").mkdir(parents=True, exist_ok=True)
        (self.folder / "tmp").chmod(0o1777)  # some tests change the user
        home = variables["HOME"]
        own = {k: v.replace(home, str(self.folder / "home")) for k, v in variables.items()}
        (self.folder / "home").mkdir(exist_ok=True)
        environment = {**os.environ, **own, "DISPLAY": self.display, "TMPDIR": str(self.folder / "tmp"),
                       "QTEST_DISABLE_STACK_DUMP": "1", **more}
        output = self.folder / "output"
        command = ["prlimit", "--core=0", "--fsize=4294967296:", program, *functions]
        with output.open("wb") as out:
            process = subprocess.Popen(command, env=environment, stdout=out, stderr=subprocess.STDOUT,
                                       stdin=subprocess.DEVNULL, cwd=self.folder, start_new_session=True)
        end, why, pause = time.monotonic() + limit, None, 0.005
        while process.poll() is None and not why:
            time.sleep(pause)
            pause = min(pause * 1.5, 0.1)
            if time.monotonic() > end:
                why = "took too long"
            elif b"\nFAIL!" in output.read_bytes()[:1 << 20]:
                why = "failed"
        with contextlib.suppress(ProcessLookupError):
            os.killpg(process.pid, signal.SIGKILL)
        process.wait()
        return why or ("failed" if process.returncode else None)


def in_parallel(desks, work, items):
    """The results of work(desk, item) for each item, as many at a time as there are desks."""
    free = queue.SimpleQueue()
    for desk in desks:
        free.put(desk)

    def one(item):
        desk = free.get()
        try:
            return work(desk, item)
        finally:
            free.put(desk)

    pool = concurrent.futures.ThreadPoolExecutor(len(desks))
    try:
        return list(pool.map(one, items))
    finally:
        pool.shutdown(cancel_futures=True)


def record(build, desks, sources, pattern, wanted):
    """For each function of some tests of a build, how long it takes and which mutants it reaches."""
    def functions(desk, item):
        name, test = item
        kept = WORK / "reached" / (digest(name, sources, hashlib.sha1(open(test[0], "rb").read()).hexdigest()) + ".json")
        if not kept.exists():
            listed = run(test[0], "-functions", capture_output=True,
                         env={**os.environ, "QT_QPA_PLATFORM": "offscreen"})
            found = {}
            for function in re.findall(r"^(\w+)\(\)", listed.stdout + listed.stderr, re.M):
                reached = WORK / f"{desk.folder.name}.reached"
                for _ in range(2):  # once more if it fails: others may share the machine
                    reached.write_bytes(bytes((len(targets()) + 1) * NUMBERS))
                    reached.chmod(0o666)  # some tests change the user
                    started = time.monotonic()
                    why = desk.run(test, [function], 600, VELOCOR_MUTANT_REACHED=str(reached))
                    if not why:
                        break
                else:
                    print(f"mutants: {build}: {name} {function} {why} without a mutant", flush=True)
                    continue
                numbers = [n for n, byte in enumerate(reached.read_bytes()) if byte]
                found[function] = [round(time.monotonic() - started, 3), numbers]
            kept.parent.mkdir(parents=True, exist_ok=True)
            kept.write_text(json.dumps(found))
        return name, test, json.loads(kept.read_text()), kept.name

    chosen = sorted(i for i in tests(build, pattern).items() if re.match(wanted, i[0]))
    found = in_parallel(desks, functions, chosen)
    reaching = {}
    for name, test, times, _ in found:
        for function, (seconds, numbers) in times.items():
            for number in numbers:
                reaching.setdefault(number, []).append((seconds, name, test, function))
    return reaching, digest(*(kept for *_, kept in found))


def notice(desk, number, functions):
    """The test that notices a mutant, if any: quick functions of a program run in one process."""
    runs = {}
    # In the order of the program: some tests need what others leave.
    for seconds, name, test, function in functions:
        own = function if seconds > 0.5 else ""
        runs.setdefault((name, own), (test, []))[1].append((seconds, function))
    def cost(entry):  # less for a test that noticed others
        return sum(seconds for seconds, _ in entry[1][1]) / (1 + NOTICED[entry[0]])

    for (name, own), (test, found) in sorted(runs.items(), key=cost):
        limit = 10 + 6 * sum(seconds for seconds, _ in found)
        why = desk.run(test, [function for _, function in found], limit, VELOCOR_MUTANT=str(number))
        if why:
            NOTICED[name, own] += 1
            return f"{name} {why}"
    return None
