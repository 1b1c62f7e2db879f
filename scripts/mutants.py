#!/usr/bin/python3
# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
"""Changes one thing at a time in the sources and reports which changes no test notices.

All changes ("mutants") of all sources are compiled at once: (velocor_mutant(7) ? (a <= b) : (a < b)).
The environment selects one. Each test function runs once unchanged, which records the mutants that it
reaches; a mutant then runs in these functions, the fastest first, until one fails. Dropped locks run
under the thread sanitizer as well, dropped deletions under the address sanitizer. Works on a copy in
build/mutants; results are kept there, so an interrupted run continues where it stopped.
"""
import argparse
import collections
import concurrent.futures
import contextlib
import fcntl
import functools
import hashlib
import itertools
import json
import multiprocessing
import os
import pathlib
import queue
import random
import re
import shlex
import shutil
import signal
import subprocess
import sys
import threading
import time

sys.dont_write_bytecode = True  # no files of its own in the checkout
import mutations  # noqa: E402

ROOT = pathlib.Path(__file__).resolve().parent.parent
WORK = ROOT / "build/mutants"
COPY = WORK / "source"
ACCEPTED = ROOT / "tests/mutants-accepted.txt"
GOALS = {"common": 97, "app": 95}  # percent
# The folders whose sources are changed, and the tests, or their folders, that may notice.
PROOFS = " tst_Faults tst_SystemLimits tst_SuddenDeath tst_Load"
ROOMS = {
    "common/config": "config plain" + PROOFS,
    "common/log": "log plain" + PROOFS,
    "common/xml": "xml config plain hostile",
    "app/logfile": "logfile window/log window",
    "app/settingsfile": "settingsfile plain hostile window",
    "app/runninglog": "runninglog window",
}
LEFT_OUT = r"locale|package|memcheck"  # labels; and runs of the same tests on other screens:
OTHER_SCREENS = "800x600|double_scale"
# The kinds of change that a sanitizer sees, and the tests that run clean under it.
SANITIZERS = {"lock": ("tsan", "thread", "tst_(TorkLog|Load)"), "delete": ("asan", "address", "tst_")}
NUMBERS = 1000  # reserved for each source
PER_SOURCE = 25  # in a sample
NOTICED = collections.Counter()


def run(*command, **options):
    return subprocess.run([str(part) for part in command], check=True, text=True, **options)


def digest(*texts):
    return hashlib.sha1("\0".join(texts).encode()).hexdigest()


def update(path, text):
    """Writes a file unless it holds that text already, so that only changes are compiled."""
    if not path.exists() or path.read_text("latin-1") != text:
        path.parent.mkdir(parents=True, exist_ok=True)
        path.write_text(text, "latin-1")


def load(path, otherwise):
    return json.loads(path.read_text()) if path.exists() else otherwise


@functools.cache
def targets():
    names = run("git", "ls-files", *ROOMS, cwd=ROOT, capture_output=True).stdout.split()
    return sorted(n for n in names if n.endswith(".cpp") or n.endswith("_p.h")
                  or n.startswith("app/") and n.endswith(".h"))


def configure(build, sanitizer=""):
    if not (WORK / build / "build.ninja").exists():
        run("cmake", "-S", COPY, "-B", WORK / build, "-G", "Ninja", "-DCMAKE_BUILD_TYPE=Debug",
            "-DCMAKE_CXX_COMPILER=clang++-14", "-DCMAKE_CXX_FLAGS_DEBUG=-O0 -g0",
            f"-DCMAKE_CXX_FLAGS=-w -include {COPY}/scripts/Mutant.h", "-DVELOCOR_PRECOMPILE=ON",
            "-DCMAKE_EXPORT_COMPILE_COMMANDS=ON", f"-DVELOCOR_SANITIZE={sanitizer}",
            f"-DCMAKE_DISABLE_PRECOMPILE_HEADERS={'ON' if sanitizer else 'OFF'}", stdout=subprocess.DEVNULL)


def find(name):
    """The mutants of a source and its new text, from build/mutants/found if nothing changed."""
    commands = {c["file"]: c for c in load(WORK / "plain/compile_commands.json", [])}
    text = (ROOT / name).read_text("latin-1")
    unit = name
    if name.endswith(".h"):  # parsed as part of a source that includes it, best its own or one beside it
        own, room = re.sub(r"(_p)?\.h$", ".cpp", name), os.path.dirname(name)
        users = [n for n in targets() if n.endswith(".cpp") and f'"{name}"' in (ROOT / n).read_text("latin-1")]
        if not users:
            return name, [], text
        unit = min(users, key=lambda n: (n != own, not n.startswith(room)))
    first = targets().index(name) * NUMBERS + 1
    kept = WORK / "found" / (digest(name, str(first), text, (ROOT / unit).read_text("latin-1"),
                                    pathlib.Path(mutations.__file__).read_text()) + ".json")
    if not kept.exists():
        words, left_out = shlex.split(commands[str(COPY / unit)]["command"]), ("-Xclang", "-o", "-c")
        resources = run("clang++-14", "-print-resource-dir", capture_output=True).stdout.strip()
        arguments = [word for before, word in zip(words, words[1:])
                     if before not in left_out and word not in (*left_out, "-Winvalid-pch")]
        arguments += ["-resource-dir", resources, "-ferror-limit=0"]
        mutants, changed = mutations.compilable(name, first, text, str(COPY / name), arguments, str(COPY / unit))
        kept.parent.mkdir(parents=True, exist_ok=True)
        kept.write_text(json.dumps([mutants, changed]))
    return name, *json.loads(kept.read_text())


def copy(sources):
    """Copies the tree; the given sources, which are changed later, only if they are missing."""
    names = run("git", "ls-files", "-z", "--cached", "--others", "--exclude-standard", cwd=ROOT,
                capture_output=True).stdout.split("\0")
    for name in names:
        if (ROOT / name).is_file() and name not in targets():
            update(COPY / name, (ROOT / name).read_text("latin-1"))
            (COPY / name).chmod((ROOT / name).stat().st_mode)
    for name in targets():
        if not (COPY / name).exists() or name not in sources:
            update(COPY / name, (ROOT / name).read_text("latin-1"))
    configure("plain")


def build_all(sources):
    """Copies the tree, with all mutants in the given sources, and builds its tests."""
    copy(sources)
    with multiprocessing.Pool() as pool:
        found = pool.map(find, sources, chunksize=1)
    for name, _, changed in found:
        update(COPY / name, changed)
    folders = {f for name in sources for f in ROOMS[os.path.dirname(name)].split()}
    run("ninja", "-C", WORK / "plain", "--quiet",
        *(f if f.startswith("tst_") else f"tests/{f}/all" for f in sorted(folders)))
    return [mutant for _, mutants, _ in found for mutant in mutants], digest(*(changed for *_, changed in found))


def tests(build):
    """The tests of a build: name, program and environment."""
    listed = run("ctest", "--test-dir", WORK / build, "--show-only=json-v1", "-LE", LEFT_OUT, "-E", OTHER_SCREENS,
                 capture_output=True).stdout
    found = {}
    for test in json.loads(listed)["tests"]:
        properties = {p["name"]: p["value"] for p in test["properties"]}
        variables = dict(v.split("=", 1) for v in properties.get("ENVIRONMENT", []))
        if test["name"].startswith("tst_") and pathlib.Path(test.get("command", ["-"])[-1]).exists():
            found[test["name"]] = (test["command"][-1], variables)
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


def record(build, desks, sources, pattern):
    """For each test function of a build, how long it takes and which mutants it reaches."""
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
                    reached.write_bytes(bytes(1 << 17))
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

    found = in_parallel(desks, functions, sorted(i for i in tests(build).items() if re.match(pattern, i[0])))
    reaching = {}
    for name, test, times, _ in found:
        for function, (seconds, numbers) in times.items():
            for number in numbers:
                reaching.setdefault(number, []).append((seconds, name, test, function))
    return reaching, digest(*(kept for *_, kept in found))


def notice(desk, number, reaching):
    """The test that notices a mutant, if any: quick functions of a program run in one process."""
    runs = {}
    # In the order of the program: some tests need what others leave.
    for seconds, name, test, function in reaching.get(number, []):
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


def what(mutant):
    return mutant["file"], mutant["function"], mutant["from"], mutant["to"]


def accepted():
    """The changes that nobody could see: blocks of "file: function", "- before", "+ after" and a reason."""
    return set(re.findall(r"^(\S+): (\S+)\n- (.*)\n\+ (.*)\n(?=\S)", ACCEPTED.read_text(), re.M))


def try_all(mutants, sources, desks, tests_wanted):
    """Runs the mutants whose result is not known yet; returns the results of all."""
    kept, known = WORK / "results.jsonl", {}
    if kept.exists():
        known = {r["key"]: r for r in map(json.loads, kept.read_text().splitlines())}
    reaching, state = record("plain", desks, sources, tests_wanted)
    lock, started, done, out = threading.Lock(), time.monotonic(), itertools.count(1), kept.open("a")
    # A survivor is tried again when a test changed.
    open_ones = [m for m in mutants if m["key"] not in known
                 or not known[m["key"]]["by"] and known[m["key"]]["state"] != state]

    def one(desk, mutant):
        why = notice(desk, mutant["id"], reaching)
        result = {"key": mutant["key"], "by": why, "state": state, "reached": mutant["id"] in reaching}
        with lock:
            out.write(json.dumps(result) + "\n")
            out.flush()
            known[mutant["key"]] = result
            if (number := next(done)) % 25 == 0:
                print(f"mutants: {number} of {len(open_ones)} in {time.monotonic() - started:.0f} s", flush=True)

    in_parallel(desks, one, open_ones)
    for kind, (build, sanitizer, pattern) in SANITIZERS.items():
        left = [m for m in mutants if m["kind"] == kind and not known[m["key"]]["by"] and what(m) not in accepted()]
        names = {name for m in left for _, name, _, _ in reaching.get(m["id"], []) if re.match(pattern, name)}
        if names:
            configure(build, sanitizer)
            run("ninja", "-C", WORK / build, "--quiet", *sorted(names))
            sanitized, _ = record(build, desks, sources, f"({'|'.join(names)})$")
            for mutant, why in zip(left, in_parallel(desks, lambda desk, m: notice(desk, m["id"], sanitized), left)):
                known[mutant["key"]]["by"] = why and f"{why} with the {sanitizer} sanitizer"
                out.write(json.dumps(known[mutant["key"]]) + "\n")
    out.close()
    return known


def report(mutants, known, is_whole):
    """Prints what survived, and what the list of accepted changes need not hold any more."""
    failed, rates, explained = False, {}, accepted()
    for name in sorted({m["file"] for m in mutants} | {e[0] for e in explained} - set(targets())):
        own = [m for m in mutants if m["file"] == name]
        survivors = [m for m in own if not known[m["key"]]["by"]]
        listed = [m for m in survivors if what(m) in explained]
        made, lasting = {what(m) for m in own}, {what(m) for m in survivors}
        for _, function, before, after in sorted(e for e in explained - lasting if is_whole and e[0] == name):
            is_made = (name, function, before, after) in made
            failed = failed or not is_made
            print(f"{ACCEPTED.name}: {'noticed' if is_made else 'no such change'}: {name}: {function}\n"
                  f"- {before}\n+ {after}")
        print(f"mutants {name}: {len(own)} made, {len(own) - len(survivors)} noticed, {len(survivors)} survived"
              + (f", {len(listed)} of them listed" if listed else ""))
        for mutant in survivors:
            if mutant in listed:
                continue
            failed = True
            reached = "" if known[mutant["key"]]["reached"] else ", not reached"
            print(f"{name}:{mutant['line']}: {mutant['function']}: {mutant['kind']}{reached}\n"
                  f"- {mutant['from']}\n+ {mutant['to']}")
        made, noticed = rates.get(name.split("/")[0], (0, 0))
        rates[name.split("/")[0]] = made + len(own) - len(listed), noticed + len(own) - len(survivors)
    for folder, (made, noticed) in rates.items():
        rate = 100 * noticed / made if made else 100
        print(f"mutants of {folder}: {noticed} of {made} noticed, {rate:.1f} %; goal: {GOALS[folder]} %")
        failed = failed or rate < GOALS[folder]
    return failed


def some(mutants, chance):
    return chance.sample(mutants, min(len(mutants), PER_SOURCE))


def some_sources(names, wanted, chance):
    """Sources chosen by chance that have enough mutants together."""
    chosen = []
    for name in chance.sample(names, len(names)):
        found = len(find(name)[1]) if wanted > 0 else 0
        if found:
            chosen.append(name)
            wanted -= min(found, PER_SOURCE)
    return sorted(chosen)


def main():
    parser = argparse.ArgumentParser(prog="mutants", description=__doc__.splitlines()[0])
    parser.add_argument("files", nargs="*", help="sources; all by default")
    parser.add_argument("--sample", type=int, help="only as many, 25 a source, chosen by the seed")
    parser.add_argument("--seed", type=int, default=1)
    parser.add_argument("--tests", default="", help="a pattern: only these tests")
    parser.add_argument("--jobs", type=int, default=os.cpu_count())
    options = parser.parse_args()

    wrong = [name for name in options.files if name not in targets()]
    if wrong:
        parser.error(f"not among the sources that are changed: {', '.join(wrong)}")
    WORK.mkdir(parents=True, exist_ok=True)
    alone = (WORK / "lock").open("w")
    fcntl.flock(alone, fcntl.LOCK_EX)
    sources = options.files or targets()
    chance = random.Random(options.seed)
    if options.sample:
        copy(sources)
        sources = some_sources(sources, options.sample, chance)
    mutants, digest_of_sources = build_all(sources)
    seen = {}
    for mutant in mutants:
        change = digest((ROOT / mutant["file"]).read_text("latin-1"), *what(mutant)[1:])
        seen[change] = seen.get(change, 0) + 1
        mutant["key"] = f"{change}{seen[change]}"
    if options.sample:
        mutants = [m for name in sources for m in some([m for m in mutants if m["file"] == name], chance)]
    desks = [Desk(number) for number in range(options.jobs)]
    try:
        known = try_all(mutants, digest_of_sources, desks, options.tests)
    finally:
        for desk in desks:
            desk.server.terminate()
            desk.server.wait()
            desk.clear()
    return report(mutants, known, not options.sample)


if __name__ == "__main__":
    sys.exit(main())
