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
import fcntl
import itertools
import json
import os
import random
import re
import sys
import threading
import time

sys.dont_write_bytecode = True  # no files of its own in the checkout
from mutant_build import ROOT, WORK, build_tests, change, configure, copy, digest, find, groups_of  # noqa: E402
from mutant_build import pattern_of, run, targets  # noqa: E402
from mutant_tests import Desk, in_parallel, notice, record  # noqa: E402

ACCEPTED = ROOT / "tests/mutants-accepted.txt"
GOALS = {"common": 97, "app": 95}  # percent
# The kinds of change that a sanitizer sees, and the tests that run clean under it.
SANITIZERS = {"lock": ("tsan", "thread", "tst_(TorkLog|Load)"), "delete": ("asan", "address", "tst_")}
SAMPLED = ["common/config", "common/log", "common/xml"]  # where the goal is reached: a sample may fail
PER_SOURCE = 20  # in it


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
        reached, tests = record("plain", desks, sources, build_tests(names, stage, len(desks)), wanted)
        state = digest(tests, str(stage))  # of other sources, the same tests may come at another stage
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
