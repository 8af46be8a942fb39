# SPDX-FileCopyrightText: 2026 The tallowfen developers
# SPDX-License-Identifier: MIT
"""One editor on scratch copies of hives, with the gestures of a user; the file is read by the independent reader."""
import json
import os
import shutil
import subprocess
import sys
import tempfile

from desktop import Failure, Program, State, has, name, place, text_of, until

PROGRAM = os.environ["TALLOWFEN_PROGRAM"]
HIVE_DUMP = os.environ["TALLOWFEN_HIVE_DUMP"]
MAKE_SAMPLE = os.environ["TALLOWFEN_MAKE_SAMPLE"]
PICTURES = os.environ["TALLOWFEN_PICTURES"]
REAL_HIVES = os.environ.get("TALLOWFEN_HIVES", "")

TITLE = "Registry Editor"
NEW_VALUE_KINDS = (
    "String Value",
    "Binary Value",
    "DWORD (32-bit) Value",
    "QWORD (64-bit) Value",
    "Multi-String Value",
    "Expandable String Value",
)


def step(what):
    print(f"-- {what}", flush=True)


def equal(seen, wanted, what):
    if seen != wanted:
        raise Failure(f"{what}: seen {seen!r}, wanted {wanted!r}")


def text_data(text):
    """Text as a value stores it."""
    return (text + "\0").encode("utf-16-le")


def list_data(texts):
    return "".join(text + "\0" for text in texts + [""]).encode("utf-16-le")


def make_sample(path, extra_keys=0):
    subprocess.run([MAKE_SAMPLE, path] + ([str(extra_keys)] if extra_keys else []), check=True)
    return path


def real_hive(scratch, hive_name):
    """A scratch copy of a real hive, None where there are none; what is left out is said and counted by the caller."""
    source = os.path.join(REAL_HIVES, hive_name)
    if not REAL_HIVES or not os.path.isfile(source):
        return None
    target = os.path.join(scratch, hive_name)
    shutil.copyfile(source, target)
    os.chmod(target, 0o600)
    return target


def faults(path):
    """What the independent checker says against the hive."""
    check = subprocess.run([HIVE_DUMP, "--check", path], capture_output=True, text=True)
    if check.returncode not in (0, 1):
        raise Failure(f"the checker ended with {check.returncode}: {check.stderr}")
    return {line for line in check.stdout.splitlines() if line and not line.startswith("leaks:")}


def read_hive(path, known_faults=()):
    """{path of a key, as a tuple below the root: {name of a value: (type, data)}}, by the independent reader. Faults
    that the hive had before anything was done to it may stay."""
    new = faults(path) - set(known_faults)
    if new:
        raise Failure(f"the hive is no longer sound: {sorted(new)[:5]}")
    dump = subprocess.run([HIVE_DUMP, path], check=True, capture_output=True, text=True)
    return parse_dump(dump.stdout)


def parse_dump(text):
    keys = {}
    for line in text.splitlines():
        entry = json.loads(line)
        path = tuple(entry["path"].split("\\")) if entry["path"] else ()
        if entry["kind"] == "key":
            keys[path] = {}
        elif entry["name"] in keys[path]:
            raise Failure(f"two values {entry['name']!r} in {entry['path']}")
        else:
            # Data that cannot be read is None in both readings.
            data = entry["data"]
            keys[path][entry["name"]] = (entry["type"], None if data is None else bytes.fromhex(data))
    return keys


class Session:
    """A running editor with one hive, TOP/HIVE, and what its file held last."""

    def __init__(self, path, top="Top", hive="HIVE", program_name="editor"):
        self.path = path
        self.root = [top, hive]
        self.known_faults = faults(path)
        self.state = self.read()
        log = os.path.join(os.path.dirname(path), f"{program_name}.log")
        self.program = Program([PROGRAM, f"{top}/{hive}", path], log)
        self.main = self.program.window(TITLE)
        self.tree = self.program.find("keys_tree")
        self.table = self.program.find("values_table")
        self.program.menu_states("Edit", "New")  # the shared actions are the menu bar's on the bus: see pick_context
        self.program.menu_states("Edit")

    def __enter__(self):
        return self

    def __exit__(self, kind, *_):
        try:
            if self.program.process.poll() is None:
                if kind is None:
                    # Left by itself, the program gives back its memory, and a sanitizer tells what it did not.
                    self.leave()
                else:
                    self.picture("failure")
                    print("open windows:", self.program.open_titles(), flush=True)
        finally:
            self.program.end()

    def leave(self):
        self.program.pick("File", "Exit")
        self.program.ended()

    def read(self):
        return read_hive(self.path, self.known_faults)

    # ---- the file -------------------------------------------------------------------------------------------------

    def unchanged(self, what):
        equal(difference(self.state, self.read()), [], f"changes after {what}")

    def changed(self, what, edit):
        """The file differs from what it held last in exactly what edit does to it."""
        edit(self.state)

        def as_asked():
            problems = difference(self.state, self.read())
            if problems:
                raise Failure(f"unlike what was asked: {problems[:6]}")
            return True

        until(as_asked, f"the file after {what}", 6)

    def value_set(self, what, key, value_name, kind, data):
        self.changed(what, lambda state: state[tuple(key)].__setitem__(value_name, (kind, bytes(data))))

    def value_gone(self, what, key, value_name):
        self.changed(what, lambda state: state[tuple(key)].pop(value_name))

    def value_renamed(self, what, key, old, new):
        def edit(state):
            values = state[tuple(key)]
            values[new] = values.pop(old)

        self.changed(what, edit)

    def key_made(self, what, key):
        self.changed(what, lambda state: state.__setitem__(tuple(key), {}))

    def key_gone(self, what, key):
        """A key and everything below it."""

        def edit(state):
            for path in [path for path in state if path[: len(key)] == tuple(key)]:
                del state[path]

        self.changed(what, edit)

    def key_renamed(self, what, key, new):
        def edit(state):
            depth = len(key)
            for path in [path for path in state if path[:depth] == tuple(key)]:
                state[path[: depth - 1] + (new,) + path[depth:]] = state.pop(path)

        self.changed(what, edit)

    # ---- the window -----------------------------------------------------------------------------------------------

    def picture(self, picture_name, window=None):
        self.program.picture(os.path.join(PICTURES, picture_name + ".png"), window)

    def status(self):
        """The text of the status bar's label."""
        return name(self.program.find(None, self.program.find(None, kind="status bar"), kind="label"))

    def cell(self, key):
        """The tree's cell of a key below the hive's root."""
        path = self.root + list(key)
        return until(lambda: self.program.tree_cell(self.tree, path), f"the tree's row {path}")

    def selected(self, key):
        path = self.root + list(key)
        until(lambda: self.program.selected_path(self.tree) == path, f"{path} to be selected")

    def click_key(self, key):
        self.program.click(self.program.scroll_to(self.tree, self.cell(key)))
        self.selected(key)

    def open_key(self, key):
        """Opens the branches that lead to a key with double clicks and clicks the key."""
        for depth in range(len(self.root) + len(key)):
            path = (self.root + list(key))[:depth]
            if not path:
                continue
            cell = until(lambda: self.program.tree_cell(self.tree, path), f"the tree's row {path}")
            if not has(cell, State.EXPANDED):
                self.program.double_click(self.program.scroll_to(self.tree, cell))
                until(lambda: has(self.program.tree_cell(self.tree, path), State.EXPANDED), f"{path} to open")
        self.click_key(key)

    def rows(self):
        return self.program.table_rows(self.table)

    def names(self):
        return [row[0] for row in self.rows()]

    def row(self, value_name):
        return next((row for row in self.rows() if row[0] == value_name), None)

    def value_cell(self, value_name):
        cell = self.program.table_cell(self.table, self.program.row_of(self.table, value_name))
        return self.program.scroll_to(self.table, cell)

    def shows(self, value_name, kind, data=None):
        """The table has this row; data is compared where it is given."""

        def look():
            row = self.row(value_name)
            return row is not None and row[1] == kind and data in (None, row[2])

        until(look, f"{value_name!r} {kind} {data!r} in the table")

    def empty_place(self):
        """A point of the table below its last row."""
        x, y, width, height = place(self.table)
        return x + 40, y + height - 30

    def fill_editor(self, text):
        """Replaces what the in-place editor holds and confirms it."""
        editor = self.program.editor()
        self.program.keys("ctrl+a")
        self.program.type(text)
        until(lambda: text_of(editor) == text, f"{text!r} in the editor")
        self.program.keys("Return")

    def message(self, title, text, press, picture=None):
        """Answers a message box that says this."""
        box = self.program.dialog(title)
        if text not in self.program.labels(box):
            raise Failure(f"the box {title!r} says {self.program.labels(box)}, wanted {text!r}")
        if picture:
            self.picture(picture, box)
        if press.startswith("key "):
            self.program.keys(press[4:])
        else:
            self.program.click(self.program.button(box, press))
        self.program.gone(box)


def difference(wanted, seen):
    """What differs between two readings, in words."""
    problems = []
    for path in sorted(set(wanted) | set(seen)):
        where = "\\".join(path)
        if path not in seen:
            problems.append(f"the key {where} is missing")
        elif path not in wanted:
            problems.append(f"the key {where} was not asked for")
        elif wanted[path] != seen[path]:
            for value_name in sorted(set(wanted[path]) | set(seen[path])):
                before, after = wanted[path].get(value_name), seen[path].get(value_name)
                if before != after:
                    problems.append(f"{where} : {value_name!r} is {brief(after)}, wanted {brief(before)}")
    return problems


def brief(value):
    if value is None:
        return "absent"
    kind, data = value
    return f"type {kind}, " + ("unreadable" if data is None else f"{len(data)} bytes {data[:40].hex()}")


def run(*scenes):
    """Runs each scene with a scratch directory of its own; the first failure ends the test."""
    for scene in scenes:
        step(scene.__doc__ or scene.__name__)
        with tempfile.TemporaryDirectory(prefix="tallowfen-gui.") as scratch:
            scene(scratch)
    print(f"{len(scenes)} scenes passed", flush=True)
    sys.exit(0)
