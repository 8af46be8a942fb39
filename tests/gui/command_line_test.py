# SPDX-FileCopyrightText: 2026 The tallowfen developers
# SPDX-License-Identifier: MIT
"""What the program answers to its command line before a window shows."""
import os
import subprocess

from desktop import Program, descendants, name, role, until
from session import PICTURES, PROGRAM, Session, equal, make_sample, run, step

HIBERNATED = (
    "Your system is in hibernate mode. Therefore the registry cannot be edited. Please restart your system and exit "
    "the hibernate mode or contact Zenta Support"
)


def answer(*arguments):
    """(status, standard error) of a run that ends by itself; a status below zero is the signal that ended it."""
    done = subprocess.run([PROGRAM, *arguments], stdin=subprocess.DEVNULL, capture_output=True, text=True, timeout=60)
    return done.returncode, done.stderr


def content(path):
    with open(path, "rb") as file:
        return file.read()


def usage(scratch):
    """A wrong count of arguments: the usage line, status 1"""
    hive = make_sample(os.path.join(scratch, "SYSTEM"))
    for arguments in ([], ["Top/HIVE"], ["Top/HIVE", hive, "Top/OTHER"], ["--hibernated", hive, "x"], ["--help"]):
        status, error = answer(*arguments)
        equal(status, 1, f"the status for {arguments}")
        # The debug channel has a line of its own, with the share directory.
        equal(error.splitlines()[-1:], ["usage: tallowfen [NAME FILE ...]"], f"standard error for {arguments}")


def bad_names(scratch):
    """A NAME without two parts: a line that names it, status 1"""
    hive = make_sample(os.path.join(scratch, "SYSTEM"))
    before = content(hive)
    for bad in ("SYSTEM", "/SYSTEM", "Top/", ""):
        status, error = answer("Top/HIVE", hive, bad, hive)
        equal(status, 1, f"the status for {bad!r}")
        last = error.splitlines()[-1]
        if bad not in last or "TOP/HIVE" not in last:
            raise AssertionError(f"standard error for {bad!r}: {error!r}")
    equal(content(hive), before, "the hive")


def bad_files(scratch):
    """A file that is missing, no regular file or no hive: a line with its name and the reason, and it is untouched"""
    hive = make_sample(os.path.join(scratch, "SYSTEM"))
    whole = content(hive)
    made = {
        "empty": b"",
        "text": b"no hive at all\n" * 1000,
        "short": whole[:6000],
        "base-block": whole[:4096],
        "signature": b"fger" + whole[4:],
    }
    for file_name, data in made.items():
        path = os.path.join(scratch, file_name)
        with open(path, "wb") as file:
            file.write(data)
        refused(path, "Cannot load hive")
        equal(content(path), data, f"the bytes of {file_name}")
    refused(os.path.join(scratch, "missing"), "Cannot open file")
    equal(os.path.exists(os.path.join(scratch, "missing")), False, "the missing file")
    refused(scratch, "Cannot open file")
    # A good hive before it changes nothing about that.
    refused(os.path.join(scratch, "missing"), "Cannot open file", "Top/GOOD", hive)
    equal(content(hive), whole, "the hive beside it")


def refused(path, reason, *before):
    status, error = answer(*before, "Top/HIVE", path)
    if status == 0:
        raise AssertionError(f"{path} was opened")
    lines = [line for line in error.splitlines() if path in line]
    if not any(reason in line for line in lines):
        raise AssertionError(f"standard error for {path}: {error!r}, wanted a line with {reason!r}")


def already_open(scratch):
    """A hive that an editor has open is not opened a second time, by this path or another"""
    path = make_sample(os.path.join(scratch, "SYSTEM"))
    link = os.path.join(scratch, "link")
    os.symlink(path, link)
    with Session(path) as session:
        for way in (path, link):
            step(way)
            refused(way, "Cannot open file")
        refused(path, "Cannot open file", "Top/ONE", make_sample(os.path.join(scratch, "OTHER")))
        session.unchanged("refused instances")
        session.open_key(["Select"])  # the first one goes on
    refused(link, "Cannot open file", "Top/ONE", path)  # twice on one command line


def hibernated(scratch):
    """--hibernated alone: the box, then status 2"""
    for argument in ("--hibernated", "--hibernatedX"):
        program = Program([PROGRAM, argument], os.path.join(scratch, "log"))
        try:
            box = program.dialog("Hibernation Detected")
            until(lambda: HIBERNATED in program.labels(box), "the box's text")
            program.picture(os.path.join(PICTURES, "hibernated.png"), box)
            equal([each for each in ("OK", "Cancel") if has_button(program, box, each)], ["OK"], "its buttons")
            program.click(program.button(box, "OK"))
            program.ended(2)
        finally:
            program.end()


def has_button(program, box, text):
    return any(role(each) == "push button" and name(each).replace("&", "") == text for each in descendants(box))


def several_hives(scratch):
    """Pairs are mounted in their order, those with one TOP under one row"""
    paths = [make_sample(os.path.join(scratch, each)) for each in ("one", "two", "three")]
    arguments = [word for mount, path in zip(("B/first", "A/second", "B/third"), paths) for word in (mount, path)]
    program = Program([PROGRAM, *arguments], os.path.join(scratch, "log"))
    try:
        program.window("Registry Editor")
        tree = program.find("keys_tree")
        equal([row.name for row in program.tree_rows(tree)], ["B", "A"], "the top rows")
        for top in ("A", "B"):
            program.double_click(program.tree_cell(tree, [top]))
        until(
            lambda: [row.name for row in program.tree_rows(tree)] == ["B", "first", "third", "A", "second"],
            "the hives below",
        )
        program.pick("File", "Exit")
        program.ended()
    finally:
        program.end()


run(usage, bad_names, bad_files, already_open, hibernated, several_hives)
