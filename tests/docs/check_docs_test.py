#!/usr/bin/env python3
# SPDX-FileCopyrightText: 2026 The tallowfen developers
# SPDX-License-Identifier: MIT
"""That the check of the documents sees each fault it is there for."""
import pathlib
import tempfile
import unittest

from check_docs import Repository, problems

PRESETS = '{"configurePresets": [{"name": "dev"}, {"name": "base", "hidden": true}], "buildPresets": [{"name": "dev"}]}'


class Faults(unittest.TestCase):
    def setUp(self):
        self.scratch = tempfile.TemporaryDirectory()
        self.addCleanup(self.scratch.cleanup)
        self.top = pathlib.Path(self.scratch.name)
        (self.top / "CMakePresets.json").write_text(PRESETS)
        for folder in ("docs", "src", "tests"):
            (self.top / folder).mkdir()
        (self.top / "src/main.cpp").touch()
        (self.top / "tests/CMakeLists.txt").write_text("tallowfen_add_test(NAME a LABEL docs COMMAND b)\n")
        (self.top / "run").touch(mode=0o755)
        (self.top / "docs/other.md").write_text("# The other one\n")

    def found(self, text):
        document = self.top / "README.md"
        document.write_text(text)
        return list(problems(Repository(self.top), document))

    def sound(self, text):
        self.assertEqual(self.found(text), [])

    def faulty(self, text, part):
        found = self.found(text)
        self.assertEqual(len(found), 1, found)
        self.assertIn(part, found[0])

    def test_links(self):
        self.sound("[a](docs/other.md) [b](docs/other.md#the-other-one) [c](https://example.org)")
        self.faulty("[a](docs/gone.md)", "leads nowhere")
        self.faulty("[a](docs/other.md#gone)", "no heading")

    def test_paths(self):
        self.sound("`src/main.cpp` `src/*.cpp` `src/` `/mnt/x` `TOP/HIVE`")
        self.faulty("`src/gone.cpp`", "src/gone.cpp")
        self.faulty("`src/*.h`", "src/*.h")
        (self.top / "tools").mkdir()
        self.faulty("`tools/`", "tools/")
        self.faulty("`tools/gone 1 2`", "tools/gone")

    def test_commands(self):
        self.sound("```sh\n./run A/B file  # comment\nsudo cat x\n```\n")
        self.sound("```\n./no-shell-block\n```\n")
        self.faulty("```sh\n./gone\n```\n", "./gone")
        self.faulty("`./gone`", "./gone")
        self.faulty("```sh\nno-such-command-anywhere\n```\n", "no-such-command-anywhere")

    def test_presets(self):
        self.sound("```sh\nctest --test-dir build/dev -L docs\n```\n")
        self.faulty("```sh\ncat --preset gone\n```\n", "preset gone")
        self.faulty("```sh\ncat --preset base\n```\n", "preset base")
        self.faulty("```sh\ncat --build --preset gone\n```\n", "preset gone")

    def test_labels(self):
        self.faulty("```sh\nctest -L gone\n```\n", "label gone")
        self.sound("| label | where |\n|---|---|\n| `docs` | here |\n")
        self.faulty("| label | where |\n|---|---|\n| `docs` | here |\n| `gone` | there |\n", "label gone")

    def test_block_inside_a_list(self):
        self.faulty("1. So:\n\n   ```sh\n   ./gone\n   ```\n", "./gone")


if __name__ == "__main__":
    unittest.main()
