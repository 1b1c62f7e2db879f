#!/usr/bin/env python3
# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
"""Runs the benchmark programs and prints one table per group. Called by ./bench.

    scripts/bench-run.py FOLDER-OF-THE-PROGRAMS [--quick] [--cpu] [--write-doc] [SECTION ...]
"""

import argparse
import datetime
import json
import os
import pathlib
import platform
import re
import shutil
import statistics
import subprocess
import sys
import tempfile

import bench_charts

ROOT = pathlib.Path(__file__).resolve().parent.parent
DOCUMENT = ROOT / "docs" / "performance.md"
CHARTS = ROOT / "docs" / "images" / "bench"
BEGIN = "<!-- tables: written by ./bench --write-doc -->"
END = "<!-- end of the tables -->"
FLOOR = "floor"


class Goal:
    """`what` costs at most `factor` times what `other` costs, in each of `groups`; `given_up` says
    for what it was given up, if it was."""

    def __init__(self, groups, what, factor, other, given_up=None):
        self.groups, self.what, self.factor, self.other = groups, what, factor, other
        self.given_up = given_up


class Limit:
    """`what` needs at most `most`, in `unit`, in each of `groups` or, if their names begin with
    "...", in all groups whose names end like that. In groups of rows, it is about a `column`.
    `quick`: whether it is also a goal for a quick run."""

    def __init__(self, groups, what, most, unit="ns", column=None, quick=False):
        self.groups, self.what, self.most, self.unit = groups, what, most, unit
        self.column, self.quick = column, quick
        self.given_up = None


class Section:
    def __init__(self, title, runs, repetitions, unit=None, goals=()):
        self.title = title
        self.runs = runs  # (program, kind of run)
        self.repetitions = repetitions  # in a full run, in a quick run
        self.unit = unit  # what the counter "units" of a measurement counts
        self.goals = goals


ENTRY = ["entry, 1 thread", "entry, 2 threads", "entry, 4 threads"]
PACED = ["paced, one per millisecond", "paced, one per second"]
LOADS = ["load 20x50 values", "load 200x500 values"]
SAVES = ["save 20x50 values", "save 200x500 values"]
WRITES = ["document to file", "document to bytes"]
LARGE_LOG = ["log of 100 MB, 1,000,000 lines"]
GIANT_LOG = "log of 1 GiB, "
LARGE_SETTINGS = [
    "settings file of 100,000 values in 1 section",
    "settings file of 100,000 values in 1,000 sections",
]
FOLLOWING = "following 50 lines a second, share of a processor"
WRITTEN = "a line written until it is seen"
FOLLOWED = "10 programs followed, a line written until it is seen"
SEVERAL_FILES = [
    "20 files as one, open",
    "20 files as one, find a text",
    "20 files as one, filter by text",
]
LONGEST_TURN = "longest turn of the event loop, 10,000 lines a second"
PARSES = ["parse generated document", "parse shared MIME database"]

SECTIONS = {
    "log": Section(
        "Log entries",
        [
            ("bench_log", "google"),
            ("bench_log_paced", "own"),
            ("bench_log_tail", "own"),
            ("bench_log_cost", "own"),
            ("bench_log_kill", "own"),
        ],
        (11, 3),
        goals=[
            Goal(ENTRY[:1], "TorkLog", 1.15, "spdlog basic_file_sink_mt"),
            Goal(ENTRY[:1], "TorkLog", 1.15, "spdlog rotating_file_sink_mt"),
            Goal(ENTRY[1:], "TorkLog", 1.0, "spdlog basic_file_sink_mt"),
            Goal(ENTRY[1:], "TorkLog", 1.0, "spdlog rotating_file_sink_mt"),
            Goal(PACED, "TorkLog", 1.0, "log4cplus", given_up="exact time stamps"),
            Goal(["off"], "TorkLog", 1.4, FLOOR, given_up="an exact time of day"),
        ],
    ),
    "config": Section(
        "Settings files",
        [("bench_config", "google")],
        (11, 3),
        goals=[
            Goal(LOADS, "TorkConfigFile", 1.1, "SAX reader, texts kept"),
            Goal(LOADS, "TorkConfigFile", 1.0, "KConfig"),
            Goal(LOADS, "TorkConfigFile", 1.0, "QSettings"),
            Goal(SAVES, "TorkConfigFile", 0.6, "pugixml"),
            Goal(SAVES, "TorkConfigFile", 2.0, FLOOR),
            Goal(["typed reads"], "TorkConfigFile", 1.5, FLOOR),
        ],
    ),
    "write": Section(
        "Writing XML",
        [("bench_xml_write", "google")],
        (7, 3),
        unit="element",
        goals=[
            Goal(WRITES, "Tork", 2.0, FLOOR),
        ],
    ),
    "parse": Section(
        "Parsing XML through states",
        [("bench_xml_parse", "google")],
        (5, 3),
        goals=[Goal(PARSES, "parse manager", 1.10, FLOOR)],
    ),
    "start": Section(
        "Start to the first painted window",
        [("bench_start", "display"), ("bench_idle", "display")],
        (40, 10),
        goals=[
            Goal(["start, time"], "velocor", 1.05, "empty window"),
            Goal(["start, peak memory"], "velocor", 0.5, FLOOR),
        ],
    ),
    "window": Section(
        "The view of a large log",
        [
            ("bench_window", "display"),
            ("bench_log_index", "google"),
            ("bench_large_log", "display"),
            ("bench_settings", "display"),
        ],
        (3, 2),
        unit="line",
        goals=[
            Limit(LARGE_LOG, "open", 2e9, quick=True),
            Limit(LARGE_LOG, "longest moment", 50e6, quick=True),
            Limit(LARGE_LOG, "scroll", 16e6, quick=True),
            Limit(LARGE_SETTINGS, "open", 0.5e9, quick=True),
            Limit(LARGE_SETTINGS, "a key to find, no match", 16e6),
            Limit(LARGE_SETTINGS, "a key to filter, all match", 16e6),
            Limit(LARGE_SETTINGS, "a key to filter, no match", 16e6),
            Limit([GIANT_LOG + "opening, processor time"], "velocor, log view", 0.6e9),
            Limit([GIANT_LOG + "memory a line"], "velocor, log view", 4, "bytes"),
            Limit([GIANT_LOG + "filter by text, processor time"], "velocor", 0.5e9),
            Limit([GIANT_LOG + "filter by expression, processor time"], "velocor", 0.8e9),
            Limit([GIANT_LOG + FOLLOWING], "velocor", 2, "%"),
            Limit([GIANT_LOG + "wake-ups while nothing happens"], "velocor", 0, "", "a second"),
            Limit([GIANT_LOG + WRITTEN], "velocor", 60e6, "ns", "p99.9"),
            Limit(["..., first page"], "velocor", 50e6, quick=True),
            Limit(["..., " + LONGEST_TURN], "velocor", 16e6, quick=True),
        ],
    ),
    "history": Section(
        "Several logs as one",
        [("bench_history", "display")],
        (5, 2),
        goals=[
            Goal(SEVERAL_FILES, "20 files", 1.2, "one file"),
            Limit(["20 files as one, memory a line"], "20 files", 6, "bytes"),
            Limit(["strip of time over 20 files as one"], "a change of zoom", 30e6, "ns", "worst"),
            Limit([FOLLOWED], "velocor", 100e6, "ns", "p99"),
        ],
    ),
    "terminal": Section(
        "Logs in a terminal",
        [("bench_terminal", "own")],
        (1, 1),
        goals=[
            Goal(["filter by expression in a terminal"], "velocor-log", 1.3, "grep -P"),
            Goal(["merge logs in a terminal"], "velocor-log", 1.5, "sort -m"),
        ],
    ),
    "growth": Section("Cost as work grows", [("bench_growth", "google")], (5, 2)),
}


# The results of a run: the samples of each contestant in each group, in order of registration.


class Samples:
    def __init__(self):
        self.groups = {}
        self.units = {}
        self.rows = {}  # by group and contestant: lists of (column, value, unit)

    def add(self, group, name, value, unit, units=None):
        samples = self.groups.setdefault(group, {}).setdefault(name, {"values": [], "unit": unit})
        samples["values"].append(value)
        if units:
            self.units[(group, name)] = units

    def median(self, group, name):
        return statistics.median(self.groups[group][name]["values"])

    def find(self, group, start):
        """The full name of the first contestant of a group whose name begins with `start`."""
        names = sorted(self.groups.get(group, {}), key=lambda name: (name != start, name))
        return next((name for name in names if name.startswith(start)), None)


NANOSECONDS = {"ns": 1.0, "us": 1e3, "ms": 1e6, "s": 1e9}


def in_base_unit(value, unit):
    return (value * NANOSECONDS[unit], "ns") if unit in NANOSECONDS else (value, unit)


def collect(samples, results, use_cpu):
    threaded = {
        entry["name"].split("/")[0] for entry in results["benchmarks"] if entry["threads"] > 1
    }
    # In order of registration, not in the random order in which they ran.
    for entry in sorted(results["benchmarks"], key=lambda entry: entry.get("family_index", 0)):
        if entry.get("error_occurred"):
            sys.exit(f"bench: {entry['name']}: {entry['error_message']}")
        if entry["run_type"] == "row":
            group, name = entry["name"].rsplit("|", 1)
            samples.rows.setdefault(group, {})[name] = entry["columns"]
        if entry["run_type"] != "iteration":
            continue
        full_name = entry["name"].split("/")[0]
        group, name = full_name.rsplit("|", 1)
        if full_name in threaded:
            count = entry["threads"]
            group += f", {count} thread" + ("s" if count > 1 else "")
        time = entry["cpu_time"] if use_cpu and "cpu_time" in entry else entry["real_time"]
        value, unit = in_base_unit(time, entry["time_unit"])
        samples.add(group, name, value, unit, entry.get("units"))


# Running the programs.


def environment(home):
    """No time zone, no Qt settings of the user, and an empty home directory."""
    kept = {
        name: value
        for name, value in os.environ.items()
        if not name.startswith(("QT_", "XDG_", "KDE_")) and name not in ("TZ", "DISPLAY")
    }
    runtime = pathlib.Path(home) / "runtime"
    runtime.mkdir(mode=0o700, exist_ok=True)
    return {**kept, "HOME": home, "LC_ALL": "C.UTF-8", "XDG_RUNTIME_DIR": str(runtime)}


def start_display():
    """Starts a virtual display; returns the process and the display's name."""
    reading, writing = os.pipe()
    process = subprocess.Popen(
        ["Xvfb", "-displayfd", str(writing), "-screen", "0", "1920x1080x24", "-nolisten", "tcp"],
        pass_fds=[writing],
        stderr=subprocess.DEVNULL,
    )
    os.close(writing)
    with os.fdopen(reading) as pipe:
        number = pipe.readline().strip()
    if not number:
        sys.exit("bench: the virtual display did not start")
    return process, f":{number}"


def run_quietly(command, variables):
    result = subprocess.run(command, env=variables, capture_output=True, text=True, check=False)
    if result.returncode:
        sys.exit(f"bench: {command[0]} failed:\n{result.stderr}")


def run_program(program, kind, repetitions, quick, home):
    results = os.path.join(home, "results.json")
    quick_flag = ["--quick"] if quick else []
    variables = environment(home)
    if kind == "google":
        command = [program, *quick_flag]
        command += [f"--benchmark_repetitions={repetitions}"]
        command += ["--benchmark_enable_random_interleaving=true"]
        command += [f"--benchmark_out={results}", "--benchmark_out_format=json"]
        run_quietly(command, variables)
    elif kind == "own":
        subprocess.run([program, results, *quick_flag], env=variables, check=True)
    else:
        display, variables["DISPLAY"] = start_display()
        try:
            command = [program, results, str(repetitions), *quick_flag]
            subprocess.run(command, env=variables, check=True)
        finally:
            display.terminate()
            display.wait()
    with open(results, encoding="utf-8") as file:
        return json.load(file)


def measure(section, programs, options):
    samples = Samples()
    repetitions = section.repetitions[1 if options.quick else 0]
    for program, kind in section.runs:
        home = tempfile.mkdtemp(prefix="velocor-bench-home-")
        try:
            path = programs / program
            results = run_program(path, kind, repetitions, options.quick, home)
            collect(samples, results, options.cpu)
        finally:
            shutil.rmtree(home)
    return samples


# The tables.


def three_digits(value):
    return f"{value:.{0 if value >= 99.95 else 1 if value >= 9.995 else 2}f}"


def formatted(value, unit):
    if unit == "KiB":
        return f"{value / 1024:.1f} MiB"
    if unit != "ns":
        return f"{three_digits(value)} {unit}".strip()
    for factor, name in ((1e9, "s"), (1e6, "ms"), (1e3, "µs")):
        if value >= factor:
            return f"{three_digits(value / factor)} {name}"
    return f"{three_digits(value)} ns"


def spread(values):
    """Half the interquartile range, relative to the median."""
    if len(values) < 3:
        return "–"
    lower, middle, upper = statistics.quantiles(values, n=4, method="inclusive")
    return f"±{(upper - lower) / 2 / middle:.0%}" if middle else "–"


def table(header, rows):
    cells = [header] + rows
    widths = [max(len(row[column]) for row in cells) for column in range(len(header))]

    def line(row):
        first = row[0].ljust(widths[0])
        others = [text.rjust(width) for text, width in zip(row[1:], widths[1:])]
        return "| " + " | ".join([first, *others]) + " |"

    rule = "|" + "|".join(
        "-" * (width + 1) + (":" if column else "-") for column, width in enumerate(widths)
    ) + "|"
    return "\n".join([line(header), rule] + [line(row) for row in rows])


def contestants_table(samples, group, unit_name):
    contestants = samples.groups[group]
    floor = samples.find(group, FLOOR)
    per_unit = unit_name and any((group, name) in samples.units for name in contestants)
    header = ["", "median", "fastest", "spread"]
    header += [f"a{'n' if unit_name[0] in 'aeiou' else ''} {unit_name}"] if per_unit else []
    header += ["× floor"] if floor else []

    rows = []
    for name in sorted(contestants, key=lambda key: samples.median(group, key)):
        values, unit = contestants[name]["values"], contestants[name]["unit"]
        median = samples.median(group, name)
        row = [name, formatted(median, unit), formatted(min(values), unit), spread(values)]
        if per_unit:
            row.append(formatted(median / samples.units[(group, name)], unit))
        if floor:
            row.append(f"{median / samples.median(group, floor):.2f}")
        rows.append(row)
    return table(header, rows) + "\n"


def plain_or_formatted(value, unit):
    if unit:
        return formatted(value, unit)
    return f"{value:,.0f}" if value == int(value) else f"{value:.2f}"


def rows_table(rows):
    """One line per contestant, sorted by its first column if that is a time."""
    names = list(rows)
    if rows[names[0]][0][2] == "ns":
        names.sort(key=lambda name: rows[name][0][1])
    header = ["", *(column for column, _, _ in rows[names[0]])]
    lines = [
        [name, *(plain_or_formatted(value, unit) for _, value, unit in rows[name])]
        for name in names
    ]
    return table(header, lines) + "\n"


def growth_table(samples):
    """Groups are named "growth|WHAT|COUNT": one row per WHAT, one column per size."""
    kinds = {}
    for group, contestants in samples.groups.items():
        kind = group.split("|", 1)[1]
        for name in contestants:
            units = samples.units[(group, name)]
            cost = samples.median(group, name) / units
            kinds.setdefault(kind, []).append((int(name), cost))
    rows = []
    for kind, costs in kinds.items():
        costs.sort()
        row = [kind] + [f"{count:,}: {formatted(cost, 'ns')}" for count, cost in costs]
        rows.append(row + [f"{costs[-1][1] / costs[0][1]:.2f}"])
    header = ["cost of one", "few", "ten times as many", "a hundred times", "last / first"]
    return table(header, rows) + "\n"


def measurement(samples, group, start):
    name = samples.find(group, start)
    if not name:
        sys.exit(f"bench: no measurement for a goal of '{group}'")
    return name, samples.median(group, name)


def limited(goal, samples, group):
    if not goal.column:
        return measurement(samples, group, goal.what)
    for name, columns in samples.rows.get(group, {}).items():
        if name.startswith(goal.what):
            value = next(value for column, value, _ in columns if column == goal.column)
            return f"{name}, {goal.column}", value
    return sys.exit(f"bench: no row for a goal of '{group}'")


def judge(goal, samples, group):
    """The goal as text, the measured value, and whether the goal is reached."""
    if isinstance(goal, Limit):
        what, value = limited(goal, samples, group)
        wanted = f"{what}: at most {formatted(goal.most, goal.unit)}"
        return wanted, formatted(value, goal.unit), value <= goal.most
    what, value = measurement(samples, group, goal.what)
    other, other_value = measurement(samples, group, goal.other)
    reference = FLOOR if goal.other == FLOOR else other
    ratio = value / other_value
    wanted = f"{what} at most {goal.factor:.3g} × {reference}"
    return wanted, f"{ratio:.2f}", ratio <= goal.factor


def groups_of(goal, samples):
    for group in goal.groups:
        if group.startswith("..."):
            yield from (name for name in samples.groups if name.endswith(group[3:]))
        else:
            yield group


def goal_lines(section, samples, quick):
    lines = []
    for goal in section.goals:
        if quick and isinstance(goal, Limit) and not goal.quick:
            continue
        for group in groups_of(goal, samples):
            wanted, value, reached = judge(goal, samples, group)
            verdict = "reached" if reached else "NOT REACHED"
            if goal.given_up and not reached:
                verdict = f"given up for {goal.given_up}"
            lines.append(f"- {group}: {wanted}: {value}, {verdict}")
    return "\n".join(lines) + "\n" if lines else ""


def charts_of(samples):
    """The charts of a section by group: medians with their quartiles, or p50 with p99."""
    charts = {}
    for group, contestants in samples.groups.items():
        rows = []
        for name in sorted(contestants, key=lambda key: samples.median(group, key)):
            values, unit = contestants[name]["values"], contestants[name]["unit"]
            median = samples.median(group, name)
            low, _, high = statistics.quantiles(values, n=4, method="inclusive")
            rows.append((name, median, low, high, formatted(median, unit)))
        charts[group] = bench_charts.chart(rows)
    for group, contestants in samples.rows.items():
        rows = []
        for name, columns in contestants.items():
            figures = {column: value for column, value, _ in columns}
            if "p99" in figures:
                text = formatted(figures["p50"], "ns")
                rows.append((name, figures["p50"], figures["p50"], figures["p99"], text))
        if rows:
            charts[group] = bench_charts.chart(sorted(rows, key=lambda row: row[1]))
    return charts


def titled(group, text, charts):
    title = group[0].upper() + group[1:]
    picture = f"![{title}](images/bench/{bench_charts.file_name(group)})\n\n"
    return f"### {title}\n\n{picture if group in charts else ''}{text}"


def report(name, section, samples, charts, quick, moment):
    if name == "growth":
        parts = [growth_table(samples)]
    else:
        parts = [
            titled(group, contestants_table(samples, group, section.unit), charts)
            for group in samples.groups
        ]
    parts += [titled(group, rows_table(rows), charts) for group, rows in samples.rows.items()]
    goals = goal_lines(section, samples, quick)
    return "\n".join([f"## {section.title}\n", f"{moment}\n", *parts] + ([goals] if goals else []))


# The machine and the date.


def first_line(command):
    try:
        result = subprocess.run(command, capture_output=True, text=True, check=True)
        return result.stdout.split("\n")[0]
    except (OSError, subprocess.CalledProcessError):
        return "unknown"


def value_in(path, key):
    with open(path, encoding="utf-8") as file:
        for line in file:
            name, _, value = line.partition(":" if ":" in line else "=")
            if name.strip() == key:
                return value.strip().strip('"')
    return "unknown"


def versions():
    packages = (
        "libqt5core5a libspdlog-dev liblog4cplus-dev liblog4cxx-dev libboost-dev "
        "libgoogle-glog-dev libkf5config-dev libpugixml-dev libxml2-dev libbenchmark-dev "
        "coreutils grep ripgrep ugrep lnav glogg"
    ).split()
    query = ["dpkg-query", "-W", "-f=${Package} ${Version}\n", *packages]
    result = subprocess.run(query, capture_output=True, text=True, check=False)
    return ", ".join(result.stdout.split("\n")[:-1])


def machine(options):
    memory = int(value_in("/proc/meminfo", "MemTotal").split()[0]) / 1024**2
    return "\n".join(
        [
            f"- Date: {datetime.date.today().isoformat()}",
            f"- Processor: {value_in('/proc/cpuinfo', 'model name')}, {os.cpu_count()} cores; "
            f"memory: {memory:.0f} GiB",
            f"- System: {value_in('/etc/os-release', 'PRETTY_NAME')}, Linux {platform.release()}, "
            f"{first_line(['c++', '--version'])}",
            f"- Versions: {versions()}",
            f"- Load when the run began (two cores busy would be 2.0): {os.getloadavg()[0]:.1f}",
            f"- Measured: {'processor time' if options.cpu else 'time'}"
            + (", quick run" if options.quick else ""),
        ]
    )


def moment():
    return (
        f"Measured on {datetime.date.today().isoformat()}; load when it began: "
        f"{os.getloadavg()[0]:.1f}"
    )


def with_sections(tables, parts):
    """The tables of the document with these sections in the place of their former selves."""
    sections = dict(part.split("\n", 1) for part in parts)
    heads, *texts = re.split(r"^(?=## )", tables, flags=re.MULTILINE)
    former = [text.split("\n", 1) for text in texts]
    missing = set(sections) - {title for title, _ in former}
    if missing:
        sys.exit(f"bench: {DOCUMENT} lacks {', '.join(missing)}; write it whole first")
    return heads + "\n".join(
        f"{title}\n{sections.get(title, text).rstrip()}\n" for title, text in former
    )


def write_document(parts, is_whole):
    document = DOCUMENT.read_text(encoding="utf-8")
    before, _, rest = document.partition(BEGIN)
    tables, end, after = rest.partition(END)
    if not end:
        sys.exit(f"bench: {DOCUMENT} has no markers for the tables")
    text = "\n".join(parts) if is_whole else with_sections(tables.strip(), parts[1:])
    DOCUMENT.write_text(f"{before}{BEGIN}\n\n{text.rstrip()}\n\n{END}{after}", encoding="utf-8")


def main():
    parser = argparse.ArgumentParser(prog="bench", description="Measures the project and its peers.")
    parser.add_argument("programs", type=pathlib.Path, help=argparse.SUPPRESS)
    parser.add_argument("sections", nargs="*", metavar="SECTION", help=", ".join(SECTIONS))
    parser.add_argument("--quick", action="store_true", help="fewer and smaller measurements")
    parser.add_argument("--cpu", action="store_true", help="processor time, for a busy machine")
    parser.add_argument("--write-doc", action="store_true", help="write the tables of docs/performance.md")
    options = parser.parse_intermixed_args()
    names = options.sections or list(SECTIONS)
    unknown = [name for name in names if name not in SECTIONS]
    if unknown:
        parser.error(f"unknown section: {', '.join(unknown)}")
    if options.write_doc and (options.quick or options.cpu):
        parser.error("--write-doc needs full measurements")

    parts = [machine(options) + "\n"]
    charts = {}
    print(parts[0], flush=True)
    for name in names:
        section = SECTIONS[name]
        begin = moment()
        samples = measure(section, options.programs, options)
        if options.write_doc and name != "growth":
            charts.update(charts_of(samples))
        parts.append(report(name, section, samples, charts, options.quick, begin))
        print(parts[-1], flush=True)
    if options.write_doc:
        is_whole = not options.sections
        bench_charts.write(CHARTS, charts, is_whole)
        write_document(parts, is_whole)


if __name__ == "__main__":
    main()
