#!/usr/bin/env python3
# SPDX-FileCopyrightText: 2026 The tallowfen developers
# SPDX-License-Identifier: MIT
"""bench_test.py TOP BUILD: runs tools/bench once in its short form with a build's programs, and looks at what it leaves."""
import json
import pathlib
import re
import shutil
import subprocess
import sys
import tempfile
import unittest
import xml.etree.ElementTree as ElementTree

TOP, BUILD = (pathlib.Path(argument) for argument in sys.argv[1:3])

# A row for each, in this order; the numbers of a short run stand where a full run has others.
ROWS = """read the file once in 16 KiB blocks
open the hive
walk all keys and values
window loads of the walk
open a path among N siblings
create a key, N under one
set a new value, N in one key
of that, the list's walk, a record
of that, all but the walk
bytes written to set a value
create and delete N keys in turn
expand N subkeys, one
show N values, one
scroll N rows to the end and back
paint a row of N MiB, text
paint a row of N MiB, binary
paint a row of N MiB, list
read and paint one of N MiB, text
read and paint one of N MiB, binary
read and paint one of N MiB, list
plain walk of the same hive
first search, key names
first search, value names
first search, both
search again, key names
search again, value names
search again, both
search N values of one key
the engine's memory, hive walked
the objects' memory, a key visited""".splitlines()

SERIES = {"set a value": 4, "create a key": 4, "open a path": 4, "expand, a subkey": 4, "show, a value": 4,
          "search, a value": 4, "pass a value's record": 3}


def without_numbers(work):
    return re.sub(r"\b(?!16 KiB)[\d,]*\d\b", "N", work)


def run(*arguments):
    return subprocess.run([str(argument) for argument in arguments], capture_output=True, text=True, check=False)


class ShortRun(unittest.TestCase):
    @classmethod
    def setUpClass(cls):
        cls.directory = tempfile.TemporaryDirectory()
        cls.out = pathlib.Path(cls.directory.name) / "out"
        cls.result = run(TOP / "tools/bench", "--short", "--build", BUILD, "--out", cls.out)
        cls.text = cls.result.stdout
        cls.table = [[cell.strip() for cell in line.strip("|").split(" | ")]
                     for line in cls.text.splitlines() if line.startswith("|")]

    @classmethod
    def tearDownClass(cls):
        cls.directory.cleanup()

    def report(self, directory):
        return run(sys.executable, "-B", TOP / "bench/report.py", directory)

    def copy(self):
        copy = pathlib.Path(self.enterContext(tempfile.TemporaryDirectory())) / "copy"
        shutil.copytree(self.out, copy)
        return copy

    def test_it_succeeds(self):
        self.assertEqual(self.result.returncode, 0, self.result.stderr)

    def test_the_table_has_every_row(self):
        self.assertEqual([without_numbers(row[0]) for row in self.table[2:]], ROWS)

    def test_every_row_with_a_goal_says_whether_it_is_met(self):
        for work, figure, _, goal, met in self.table[2:]:
            self.assertNotEqual(figure, "", work)
            self.assertIn(met, ("yes", "NO") if goal and "alone grows" not in goal else ("",), work)

    def test_the_table_that_is_kept_is_the_one_that_is_printed(self):
        self.assertEqual((self.out / "table.md").read_text(encoding="utf-8"), self.text)

    def test_the_plot_is_whole(self):
        picture = ElementTree.parse(self.out / "time.svg").getroot()
        space = {"svg": "http://www.w3.org/2000/svg"}
        found = {}
        for group in picture.findall("svg:g[@class='series']", space):
            found[group.findtext("svg:title", namespaces=space)] = len(group.findall("svg:circle[svg:title]", space))
        self.assertEqual(found, SERIES)
        width, height = float(picture.get("width")), float(picture.get("height"))
        for circle in picture.iter(f"{{{space['svg']}}}circle"):
            self.assertTrue(0 < float(circle.get("cx")) < width and 0 < float(circle.get("cy")) < height)

    def test_results_that_lack_a_benchmark_are_refused(self):
        copy = self.copy()
        path = copy / "ui_bench.json"
        results = json.loads(path.read_text(encoding="utf-8"))
        results["benchmarks"] = [b for b in results["benchmarks"] if not b["name"].startswith("ShowValues")]
        path.write_text(json.dumps(results), encoding="utf-8")
        refused = self.report(copy)
        self.assertNotEqual(refused.returncode, 0)
        self.assertIn("ShowValues", refused.stderr)

    def test_a_figure_past_its_goal_is_told(self):
        copy = self.copy()
        path = copy / "memory_bench.json"
        results = json.loads(path.read_text(encoding="utf-8"))
        for entry in results["benchmarks"]:
            if "B/key" in entry:
                entry["B/key"] = 201
        path.write_text(json.dumps(results), encoding="utf-8")
        self.assertRegex(self.report(copy).stdout, r"a key visited +\| 201 bytes .*\| NO +\|")

    def test_what_it_does_not_know_is_refused(self):
        self.assertEqual(run(TOP / "tools/bench", "--fast").returncode, 2)
        self.assertEqual(run(TOP / "tools/bench", "--hive").returncode, 2)
        missing = run(TOP / "tools/bench", "--hive", self.out / "none", "--build", BUILD)
        self.assertEqual(missing.returncode, 1)
        self.assertIn("there is no file", missing.stderr)


if __name__ == "__main__":
    unittest.main(argv=sys.argv[:1])
