# SPDX-FileCopyrightText: 2026 The tallowfen developers
# SPDX-License-Identifier: MIT
"""However the program ends, what was finished is in the file."""
import os
import signal
import subprocess

from desktop import place, until, xdotool
from session import TITLE, Session, equal, make_sample, read_hive, difference, run, text_data

CONTROL = ["ControlSet001", "Control"]


def make_one_value(session, value):
    """A string value with its own name as data, by menu and keyboard; gives back when the table shows it."""
    program = session.program
    program.pick("Edit", "New", "String Value")
    session.fill_editor(value)
    session.shows(value, "REG_SZ", "")
    program.keys("Return")
    dialog = program.dialog("Edit String")
    program.type(value)
    program.keys("Return")
    program.gone(dialog)
    session.shows(value, "REG_SZ", value)
    session.state[tuple(CONTROL)][value] = (1, text_data(value))


def by_menu(session):
    session.program.pick("File", "Exit")


def by_key(session):
    session.program.keys("alt+F4")


def by_title_bar(session):
    """The close button, at the right end of the frame's upper edge."""
    window = xdotool("search", "--onlyvisible", "--name", f"^{TITLE}$").split()[-1]
    extents = subprocess.run(
        ["xprop", "-id", window, "_NET_FRAME_EXTENTS"], check=True, capture_output=True, text=True
    ).stdout
    upper = int(extents.split("=")[1].split(",")[2])
    x, y, width, _ = place(session.main)
    session.program.click((x + width - upper // 2, y - upper // 2))


def asked_to_end(scratch):
    """Ended by menu, by keyboard and by the window's close button: status 0"""
    path = make_sample(os.path.join(scratch, "SYSTEM"))
    for i, way in enumerate((by_menu, by_key, by_title_bar)):
        with Session(path) as session:
            session.open_key(CONTROL)
            make_one_value(session, f"Ended {i}")
            way(session)
            session.program.ended()
            session.unchanged("the end")


def killed(scratch):
    """Killed right after each finished gesture: nothing is lost, and the hive opens again"""
    path = make_sample(os.path.join(scratch, "SYSTEM"))

    def made_value(session):
        make_one_value(session, "Killed after")

    def made_key(session):
        session.program.pick("Edit", "New", "Key")
        session.fill_editor("Made and killed")
        session.selected(CONTROL + ["Made and killed"])
        session.state[tuple(CONTROL + ["Made and killed"])] = {}

    def deleted_value(session):
        session.program.click(session.value_cell("Killed after"))
        session.program.keys("Delete")
        session.message("Confirm Value Removal", "Are you sure you want to delete this value?", "Yes")
        until(lambda: session.row("Killed after") is None, "the value to leave the table")
        del session.state[tuple(CONTROL)]["Killed after"]

    def deleted_key(session):
        key = CONTROL + ["Session Manager"]
        session.open_key(key)
        session.program.keys("Delete")
        session.message("Confirm Key Removal", "Are you sure you want to delete this key and its subkeys?", "Yes")
        until(lambda: session.program.tree_cell(session.tree, session.root + key) is None, "the key to leave the tree")
        for below in [each for each in session.state if each[: len(key)] == tuple(key)]:
            del session.state[below]

    for gesture in (made_value, made_key, deleted_value, deleted_key):
        with Session(path) as session:
            session.open_key(CONTROL)
            gesture(session)
            session.program.process.send_signal(signal.SIGKILL)
            equal(session.program.status(), -signal.SIGKILL, "the status")
            equal(difference(session.state, read_hive(path)), [], f"what is lost after {gesture.__name__}")


run(asked_to_end, killed)
