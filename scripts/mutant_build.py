# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
"""Makes the copy of the tree that mutants.py works on, changes its sources and builds its tests."""
import functools
import hashlib
import json
import multiprocessing
import os
import pathlib
import re
import shlex
import subprocess

import mutations

ROOT = pathlib.Path(__file__).resolve().parent.parent
WORK = ROOT / "build/mutants"
COPY = WORK / "source"
# The folders whose sources are changed, and the tests, or their folders, that may notice: each group
# is built and run only for what the ones before it did not notice.
PROOFS = "tst_Faults tst_SystemLimits tst_SuddenDeath tst_Load tst_Life"
PLAIN_LOGS = ("tst_PlainActivity tst_PlainLineParser tst_PlainLineTable tst_PlainLogFileType "
              "tst_PlainLogIndex tst_PlainLogRows tst_PlainSearch tst_LogLives")
PLAIN_HISTORIES = "tst_HistoryLives tst_PlainFamily tst_PlainPatterns tst_PlainRepeats tst_PlainTerminal"
HISTORIES_IN_WINDOW = "tst_AllFilesInWindow tst_FamilyInWindow tst_RepeatsInWindow"
ROOMS = {
    "common/config": ("config", "plain", PROOFS),
    "common/log": ("log", "plain", PROOFS),
    "common/xml": ("xml", "config plain", "hostile"),
    "app/history": ("history", PLAIN_HISTORIES, HISTORIES_IN_WINDOW),
    "app/logfile": ("logfile", PLAIN_LOGS, f"history {PLAIN_HISTORIES}"),
    "app/report": ("report", "tst_PlainRedaction"),
    "app/settingsfile": ("settingsfile", "plain hostile", "window"),
    "app/runninglog": ("runninglog", "window"),
}
NUMBERS = 1000  # reserved for each source


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
    for name, mutants, changed in found:
        if len(mutants) >= NUMBERS:
            raise SystemExit(f"mutants: {name} has more changes than numbers")
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
