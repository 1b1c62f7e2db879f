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
# The folders whose sources are changed, and the tests, or their folders, that may notice: each group
# is built and run only for what the ones before it did not notice.
PROOFS = "tst_Faults tst_SystemLimits tst_SuddenDeath tst_Load tst_Life"
PLAIN_LOGS = ("tst_PlainLineParser tst_PlainLineTable tst_PlainLogFileType tst_PlainLogIndex tst_PlainLogRows "
              "tst_PlainSearch tst_LogLives")
ROOMS = {
    "common/config": ("config", "plain", PROOFS),
    "common/log": ("log", "plain", PROOFS),
    "common/xml": ("xml", "config plain", "hostile"),
    "app/history": ("history", "tst_HistoryLives tst_PlainTerminal"),
    "app/logfile": ("logfile", PLAIN_LOGS),
    "app/settingsfile": ("settingsfile", "plain hostile", "window"),
    "app/runninglog": ("runninglog", "window"),
}
LEFT_OUT = r"locale|package|memcheck"  # labels; and runs of the same tests on other screens:
OTHER_SCREENS = "800x600|double_scale"
# The kinds of change that a sanitizer sees, and the tests that run clean under it.
SANITIZERS = {"lock": ("tsan", "thread", "tst_(TorkLog|Load)"), "delete": ("asan", "address", "tst_")}
NUMBERS = 1000  # reserved for each source
SAMPLED = ["common/config", "common/log", "common/xml"]  # where the goal is reached: a sample may fail
PER_SOURCE = 20  # in it
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
    run("ninja", "-C", WORK / build, "--quiet", "build.ninja")  # there may be other sources now


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
    """Copies the tree; the given sources, which are changed later, only if they are missing or newer."""
    names = run("git", "ls-files", "-z", "--cached", "--others", "--exclude-standard", cwd=ROOT,
                capture_output=True).stdout.split("\0")
    for name in names:
        if (ROOT / name).is_file() and name not in targets():
            update(COPY / name, (ROOT / name).read_text("latin-1"))
            (COPY / name).chmod((ROOT / name).stat().st_mode)
    for name in targets():
        if (name not in sources or not (COPY / name).exists()
                or (ROOT / name).stat().st_mtime > (COPY / name).stat().st_mtime):
            update(COPY / name, (ROOT / name).read_text("latin-1"))
    configure("plain")


def change(sources, jobs):
    """Copies the tree, with all mutants in the given sources; returns these and a digest of the texts."""
    copy(sources)
    with multiprocessing.Pool(jobs) as pool:
        found = pool.map(find, sources, chunksize=1)
    for name, _, changed in found:
        update(COPY / name, changed)
    return [mutant for _, mutants, _ in found for mutant in mutants], digest(*(changed for *_, changed in found))


@functools.cache
def groups_of(name):
    """The groups of tests that may notice mutants of a source; the test of its class comes first."""
    room, own = os.path.dirname(name), f"tst_{re.sub(r'(_p)?[.](cpp|h)$', '', os.path.basename(name))}"
    has_own = (ROOT / "tests" / os.path.basename(room) / f"{own}.cpp").exists()
    return (own, *ROOMS[room]) if has_own else ROOMS[room]


def pattern_of(names, stage):
    """A pattern of the paths of the tests in one group of these sources."""
    tests = sorted({test for name in names for test in groups_of(name)[stage].split()})
    return "|".join(f"{test}$" if test.startswith("tst_") else f"tests/{test}/" for test in tests)


def build_tests(names, stage, jobs):
    """Builds the tests that may notice mutants of these sources; returns a pattern of their paths."""
    tests = sorted({test for name in names for test in groups_of(name)[stage].split()})
    run("ninja", "-C", WORK / "plain", f"-j{jobs}", "--quiet",
        *(test if test.startswith("tst_") else f"tests/{test}/all" for test in tests))
    return pattern_of(names, stage)


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


def what(mutant):
    return mutant["file"], mutant["function"], mutant["from"], mutant["to"]


def accepted():
    """The changes that nobody could see: blocks of "file: function", "- before", "+ after" and a reason."""
    return set(re.findall(r"^(\S+): (\S+)\n- (.*)\n\+ (.*)\n(?=\S)", ACCEPTED.read_text(), re.M))


def try_all(mutants, sources, desks, wanted):
    """Runs the mutants whose result is not known yet; returns the results of all."""
    kept, known = WORK / "results.jsonl", {}
    if kept.exists():
        known = {r["key"]: r for r in map(json.loads, kept.read_text().splitlines())}
    for mutant in mutants:
        known.setdefault(mutant["key"], {"key": mutant["key"], "by": None, "reached": False, "survived": []})
    lock, out = threading.Lock(), kept.open("a")

    def note(mutant, **more):
        with lock:
            known[mutant["key"]].update(more)
            out.write(json.dumps(known[mutant["key"]]) + "\n")
            out.flush()

    reaching = {}

    def open_ones(which, state):
        """Not noticed yet; a survivor is tried again when a test changed."""
        return [m for m in which if not known[m["key"]]["by"] and state not in known[m["key"]]["survived"]]

    for stage in range(4):
        left = [m for m in open_ones(mutants, None) if stage < len(groups_of(m["file"]))
                and (stage == 0 or what(m) not in accepted())]
        if not left:
            break
        names = sorted({m["file"] for m in left})
        reached, state = record("plain", desks, sources, build_tests(names, stage, len(desks)), wanted)
        for number, functions in reached.items():
            reaching.setdefault(number, []).extend(functions)
        left = open_ones(left, state)
        started, done = time.monotonic(), itertools.count(1)

        def one(desk, mutant):
            result = known[mutant["key"]]
            own = f"/({pattern_of([mutant['file']], stage)})"
            functions = [f for f in reached.get(mutant["id"], []) if re.search(own, f[2][0])]
            note(mutant, by=notice(desk, mutant["id"], functions), survived=[*result["survived"], state],
                 reached=mutant["id"] in reaching)
            if (number := next(done)) % 25 == 0:
                print(f"mutants: {number} of {len(left)} in {time.monotonic() - started:.0f} s", flush=True)

        in_parallel(desks, one, left)
    for kind, (build, sanitizer, pattern) in SANITIZERS.items():
        left = [m for m in open_ones(mutants, None) if m["kind"] == kind and what(m) not in accepted()]
        names = {name for m in left for _, name, _, _ in reaching.get(m["id"], []) if re.match(pattern, name)}
        if names:
            configure(build, sanitizer)
            run("ninja", "-C", WORK / build, f"-j{len(desks)}", "--quiet", *sorted(names))
            reached, state = record(build, desks, sources, "|".join(f"{name}$" for name in names), wanted)
            left = open_ones(left, state)
            for mutant, why in zip(left, in_parallel(desks, lambda desk, m: notice(desk, m["id"], reached.get(m["id"], [])), left)):
                note(mutant, by=why and f"{why} with the {sanitizer} sanitizer",
                     survived=[*known[mutant["key"]]["survived"], state])
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


def candidates(mutants):
    """What a sample is drawn from: without what needs another build, or nobody could see."""
    return [m for m in mutants if m["kind"] not in SANITIZERS and what(m) not in accepted()]


def some_sources(wanted, chance):
    """Sources of one room, chosen by chance, that have enough mutants together."""
    room = chance.choice(SAMPLED)
    names = [name for name in targets() if os.path.dirname(name) == room]
    copy(names)
    chosen = []
    for name in chance.sample(names, len(names)):
        found = len(candidates(find(name)[1])) if wanted > 0 else 0
        if found:
            chosen.append(name)
            wanted -= min(found, PER_SOURCE)
    return sorted(chosen)


def main():
    parser = argparse.ArgumentParser(prog="mutants", description=__doc__.splitlines()[0])
    parser.add_argument("files", nargs="*", help="sources; all by default")
    parser.add_argument("--sample", type=int, help=f"only as many of each named source, or of one room, {PER_SOURCE} a source; chosen by the seed")
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
    chance = random.Random(options.seed)
    sources = options.files or (some_sources(options.sample, chance) if options.sample else targets())
    mutants, digest_of_sources = change(sources, options.jobs)
    seen = {}
    for mutant in mutants:
        key = digest((ROOT / mutant["file"]).read_text("latin-1"), *what(mutant)[1:])
        seen[key] = seen.get(key, 0) + 1
        mutant["key"] = f"{key}{seen[key]}"
    if options.sample:
        drawn = [candidates(m for m in mutants if m["file"] == name) for name in sources]
        most = options.sample if options.files else PER_SOURCE
        mutants = [m for own in drawn for m in chance.sample(own, min(len(own), most))]
    desks = [Desk(number) for number in range(options.jobs)]
    try:
        known = try_all(mutants, digest_of_sources, desks, options.tests)
    finally:
        for desk in desks:
            desk.server.terminate()
            desk.server.wait()
            desk.clear()
    return report(mutants, known, not options.sample and not options.tests)


if __name__ == "__main__":
    sys.exit(main())
