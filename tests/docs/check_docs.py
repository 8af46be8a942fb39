#!/usr/bin/env python3
# SPDX-FileCopyrightText: 2026 The tallowfen developers
# SPDX-License-Identifier: MIT
"""check_docs.py TOP: relative links in the documents lead to files and their anchors to headings; paths, presets, labels
and commands that the documents name exist."""
import json
import pathlib
import re
import shlex
import shutil
import sys

# First parts of paths that mean something in this repository when they stand in a document.
FOLDERS = "bench cmake docs engine packaging share src tests tools .ci .github".split()
# Commands that a document may name although the machine that runs the test need not have them.
ELSEWHERE = {"sudo", "tallowfen"}


class Repository:
    """What the documents may refer to."""

    def __init__(self, top):
        self.top = pathlib.Path(top)
        presets = json.loads((self.top / "CMakePresets.json").read_text())
        self.presets = {p["name"] for p in presets["configurePresets"] if not p.get("hidden")}
        self.build_presets = {p["name"] for p in presets["buildPresets"]}
        lists = "".join(path.read_text() for path in (self.top / "tests").rglob("CMakeLists.txt"))
        self.labels = set(re.findall(r"\bLABEL\s+(\w+)", lists))

    def documents(self):
        return sorted([*self.top.glob("*.md"), *(self.top / "docs").rglob("*.md")])

    def has(self, path):
        if "*" in path:
            return any(self.top.glob(path.rstrip("/")))
        # An empty folder is none: a clone does not have it.
        file = self.top / path
        return any(file.iterdir()) if file.is_dir() else file.exists()


def code_blocks(text):
    """(language, lines) of every fenced block."""
    return [(m.group(2), m.group(3).splitlines())
            for m in re.finditer(r"^([ \t]*)```(\w*)\n(.*?)^[ \t]*```$", text, re.M | re.S)]


def without_blocks(text):
    return re.sub(r"^[ \t]*```.*?^[ \t]*```$", "", text, flags=re.M | re.S)


def anchor(heading):
    return re.sub(r"[^\w\- ]", "", heading.strip().lower()).replace(" ", "-")


def link_problems(document, text):
    for target in re.findall(r"\]\(([^)\s]+)\)", without_blocks(text)):
        if re.match(r"[a-z]+:", target):
            continue
        path, _, part = target.partition("#")
        file = document.parent / path if path else document
        if not file.exists():
            yield f"the link to {target} leads nowhere"
        elif part and part not in {anchor(h) for h in re.findall(r"^#+ (.*)$", file.read_text(encoding="utf-8"), re.M)}:
            yield f"the link to {target} leads to no heading"


def path_problems(repository, text):
    for code in re.findall(r"`([^`\n]+)`", without_blocks(text)):
        code = code.split()[0] if code.startswith("tools/") else code
        if " " not in code and code.split("/")[0] in FOLDERS and "/" in code and not repository.has(code):
            yield f"there is no {code}"
        if re.match(r"\./\w", code):
            yield from command_problems(repository, code)


def label_problems(repository, text):
    """Tables whose first column is headed "label" name labels of tests."""
    table = re.search(r"^\| *label *\|.*\n(?:\|.*\n)+", text, re.M)
    for label in re.findall(r"^\| *`(\w+)` *\|", table.group(0), re.M) if table else []:
        if label not in repository.labels:
            yield f"no test has the label {label}"


def option_problems(repository, words):
    for option, value in zip(words, words[1:]):
        if option == "--preset":
            known = repository.build_presets if "--build" in words else repository.presets
            if value not in known:
                yield f"there is no preset {value}"
        if option == "-L" and words[0] == "ctest" and value not in repository.labels:
            yield f"no test has the label {value}"
        if option == "--test-dir" and value.removeprefix("build/") not in repository.presets:
            yield f"no preset builds in {value}"


def command_problems(repository, line):
    words = shlex.split(line, comments=True)
    while words and (words[0] == "sudo" or re.match(r"\w+=", words[0])):
        words = words[1:]
    if not words:
        return
    name = words[0]
    if name.startswith("./") or ("/" in name and name.split("/")[0] in FOLDERS):
        path = repository.top / name
        if not path.is_file() or not path.stat().st_mode & 0o100:
            yield f"there is no command {name}"
    elif name not in ELSEWHERE and not shutil.which(name) and not pathlib.Path(name).is_file():
        yield f"there is no command {name}"
    yield from option_problems(repository, words)


def problems(repository, document):
    text = document.read_text(encoding="utf-8")
    yield from link_problems(document, text)
    yield from path_problems(repository, text)
    yield from label_problems(repository, text)
    for language, lines in code_blocks(text):
        if language == "sh":
            for line in lines:
                yield from command_problems(repository, line)


def main():
    repository = Repository(sys.argv[1])
    documents = repository.documents()
    found = [f"{document.relative_to(repository.top)}: {problem}"
             for document in documents for problem in problems(repository, document)]
    if found:
        sys.exit("\n".join(found))
    print(f"{len(documents)} documents")


if __name__ == "__main__":
    main()
