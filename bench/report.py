#!/usr/bin/env python3
# SPDX-FileCopyrightText: 2026 The tallowfen developers
# SPDX-License-Identifier: MIT
"""report.py DIR: prints the table of the benchmarks' results that tools/bench left in DIR, as Markdown, and writes it to
DIR/table.md and the plot of time against N to DIR/time.svg."""
import json
import math
import pathlib
import sys

import plot

PROGRAMS = ("engine_bench", "search_bench", "ui_bench", "memory_bench")
MICROSECONDS = {"ns": 1e-3, "us": 1.0, "ms": 1e3, "s": 1e6}
KINDS = {1: "key names", 2: "value names", 3: "both"}


class Result:
    """The medians of one benchmark with one set of arguments."""

    def __init__(self, entry):
        self.time = entry["cpu_time"] * MICROSECONDS[entry["time_unit"]]
        self.counters = {name: value for name, value in entry.items() if isinstance(value, (int, float))}

    def __getitem__(self, counter):
        return self.counters[counter]


class Results:
    """All results of a run: by the benchmark's name, and by its arguments below that."""

    def __init__(self, directory):
        self.context = {}
        self.by_name = {}
        for program in PROGRAMS:
            run = json.loads((directory / f"{program}.json").read_text(encoding="utf-8"))
            self.context = run["context"]
            for entry in run["benchmarks"]:
                if entry.get("aggregate_name") == "median":
                    name, *arguments = entry["run_name"].split("/")
                    numbers = tuple(int(n) for n in arguments if n.isdigit())
                    self.by_name.setdefault(name, {})[numbers] = Result(entry)

    def one(self, name, *arguments):
        return self.by_name[name][arguments]

    def series(self, name):
        """(N, result) by growing N, for a benchmark whose one argument is N."""
        return sorted((n, result) for (n,), result in self.by_name[name].items())

    def per_item(self, name):
        """(N, microseconds for one of N)."""
        return [(n, result.time / n) for n, result in self.series(name)]


class Table:
    def __init__(self):
        self.rows = []

    def add(self, work, figure, ratio="", goal="", met=None):
        self.rows.append((work, figure, ratio, goal, "" if met is None else "yes" if met else "NO"))

    def markdown(self):
        head = ("work", "figure", "ratio", "goal", "met")
        widths = [max(len(row[i]) for row in [head, *self.rows]) for i in range(len(head))]
        lines = [" | ".join(cell.ljust(width) for cell, width in zip(row, widths)) for row in [head, *self.rows]]
        lines.insert(1, " | ".join("-" * width for width in widths))
        return "".join(f"| {line} |\n" for line in lines)


def time_text(microseconds):
    for unit, size in (("s", 1e6), ("ms", 1e3), ("µs", 1.0), ("ns", 1e-3)):
        if microseconds >= size:
            break
    return f"{microseconds / size:.3g} {unit}"


def exponent(points):
    """p where the time goes with N to the power of p, from the first of the points to the last."""
    (n, time), (last_n, last_time) = points[0], points[-1]
    return math.log(last_time / time) / math.log(last_n / n)


def steepest(points):
    return max(after[1] / before[1] for before, after in zip(points, points[1:]))


def file_rows(results, table):
    once = results.one("ReadFileOnce")
    opened = results.one("OpenHive").time / once.time
    walk = results.one("WalkAll")
    walked = walk.time / once.time
    table.add("read the file once in 16 KiB blocks", time_text(once.time), "1")
    table.add("open the hive", time_text(results.one("OpenHive").time), f"{opened:.2f}", "at most 1.5", opened <= 1.5)
    table.add("walk all keys and values", time_text(walk.time), f"{walked:.1f}", "at most 40", walked <= 40)
    loads = walk["reads/op"] / (walk["keys"] + walk["values"])
    table.add("window loads of the walk", f"{walk['reads/op']:,.0f}", f"{loads:.2f} a key or value", "at most 0.88",
              loads <= 0.88)
    paths = results.series("OpenPath")
    (quarter, before), (n, path) = paths[-2:]
    growth = path.time / before.time
    table.add(f"open a path among {n:,} siblings", time_text(path.time), f"{growth:.2f} from {quarter:,}",
              "grows as a logarithm: at most 1.5", growth <= 1.5)


def change_rows(results, table):
    keys = results.per_item("CreateKeys")[-3:]
    n = keys[-1][0]
    table.add(f"create a key, {n:,} under one", time_text(keys[-1][1]),
              f"{steepest(keys):.2f} when N doubles; exponent {exponent(keys):.2f}", "at most 1.5", steepest(keys) <= 1.5)
    values = results.per_item("SetValues")[-3:]
    table.add(f"set a new value, {n:,} in one key", time_text(values[-1][1]),
              f"{steepest(values):.2f} when N doubles; exponent {exponent(values):.2f}", "the list's walk alone grows")
    records = results.per_item("FindMissingValue")
    worst = max(time for _, time in records)
    table.add("of that, the list's walk, a record", time_text(worst), "", "at most 60 ns", worst <= 0.06)
    rest = [result["restUs"] for _, result in results.series("SetValuesBesideWalk")]
    growth = (rest[-1] / rest[0]) ** (1 / (len(rest) - 1)) if min(rest) > 0 else math.inf
    table.add("of that, all but the walk", time_text(rest[-1]), f"{growth:.2f} when N doubles",
              "does not grow: at most 1.25", growth <= 1.25)
    written = [(n, result["writtenB/op"]) for n, result in results.series("SetValues")[-3:]]
    table.add("bytes written to set a value", f"{written[-1][1]:,.0f}", f"{steepest(written):.2f} when N doubles",
              "at most 1.25", steepest(written) <= 1.25)
    turns = results.one("CreateAndDelete")
    table.add(f"create and delete {turns['keys']:,.0f} keys in turn", f"{turns['grownB']:,.0f} bytes longer", "",
              "at most a bin, 4,096", turns["grownB"] <= 4096)


def window_rows(results, table):
    for name, work, most in (("ExpandKey", "expand {:,} subkeys, one", 10), ("ShowValues", "show {:,} values, one", 15)):
        points = results.per_item(name)
        n, time = points[-1]
        table.add(work.format(n), time_text(time), f"{points[-1][1] / points[-2][1]:.2f} when N doubles",
                  f"under {most} µs", time < most)
    (_, half), (n, scroll) = results.series("ScrollKeys")
    growth = max(scroll[counter] / half[counter] for counter in ("data/op", "index/op"))
    table.add(f"scroll {n:,} rows to the end and back", f"{scroll['data/op']:.0f} calls of data()",
              f"{growth:.2f} when N doubles", "none off the screen: 1", growth <= 1.01)
    for name, work in (("PaintRow", "paint a row of 1 MiB, {}"), ("ShowLongValue", "read and paint one of 1 MiB, {}")):
        for kind, kind_name in ((1, "text"), (3, "binary"), (7, "list")):
            long = results.one(name, kind, 1 << 20).time
            ratio = long / results.one(name, kind, 1 << 10).time
            table.add(work.format(kind_name), time_text(long), f"{ratio:.2f} of 1 KiB", "at most 2", ratio <= 2)


def search_rows(results, table):
    plain = results.one("PlainWalk").time
    table.add("plain walk of the same hive", time_text(plain), "1")
    for name, work in (("FirstSearch", "first search, {}"), ("SearchAgain", "search again, {}")):
        for kind, kind_name in KINDS.items():
            time = results.one(name, kind).time
            table.add(work.format(kind_name), time_text(time), f"{time / plain:.2f}", "at most 3", time <= 3 * plain)
    (half, before), (n, after) = results.series("SearchInOneKey")[-2:]
    linear = after.time / before.time / (n / half)
    table.add(f"search {n:,} values of one key", time_text(after.time), f"{linear:.2f} of linear", "at most 1.3",
              linear <= 1.3)


def memory_rows(results, table):
    engine = results.one("EngineMemory")["walkedB"]
    table.add("the engine's memory, hive walked", f"{engine / 1024:,.0f} KiB", "", "at most 2 MiB", engine <= 2 << 20)
    objects = results.one("ObjectMemory")["B/key"]
    table.add("the objects' memory, a key visited", f"{objects:.0f} bytes", "", "at most 200 bytes", objects <= 200)


def table_of(results):
    table = Table()
    for rows in (file_rows, change_rows, window_rows, search_rows, memory_rows):
        rows(results, table)
    return table


def series_of(results):
    return [
        ("set a value", results.per_item("SetValues")),
        ("create a key", results.per_item("CreateKeys")),
        ("open a path", [(n, result.time) for n, result in results.series("OpenPath")]),
        ("expand, a subkey", results.per_item("ExpandKey")),
        ("show, a value", results.per_item("ShowValues")),
        ("search, a value", results.per_item("SearchInOneKey")),
        ("pass a value's record", results.per_item("FindMissingValue")),
    ]


def main():
    directory = pathlib.Path(sys.argv[1])
    results = Results(directory)
    try:
        table = table_of(results).markdown()
        picture = plot.drawing(series_of(results))
    except KeyError as missing:
        sys.exit(f"report.py: the results lack {missing}")
    machine = results.context
    size = results.one("EngineMemory")["fileB"]
    keys = results.one("WalkAll")["keys"]
    head = (f"{machine['num_cpus']} cores of {machine['mhz_per_cpu'] / 1000:.1f} GHz; a hive of {size / 1e6:,.1f} MB with "
            f"{keys:,.0f} keys; medians of CPU times.\n\n")
    (directory / "table.md").write_text(head + table, encoding="utf-8")
    (directory / "time.svg").write_text(picture, encoding="utf-8")
    print(head + table, end="")


if __name__ == "__main__":
    main()
