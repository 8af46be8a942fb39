# SPDX-FileCopyrightText: 2026 The tallowfen developers
# SPDX-License-Identifier: MIT
"""A damaged key met while browsing: told once, by name, and the rest of the hive goes on."""
import os

from desktop import State, has, until
from session import TITLE, Session, equal, make_sample, run

SERVICES = ["ControlSet001", "Services"]
KEY_RECORD = 76  # bytes before the name


def record_of(content, key):
    """Where the record of the first key with this name begins."""
    at = content.index(key) - KEY_RECORD
    equal(content[at : at + 2], b"nk", "the signature of the record to damage")
    return at


def damaged_sample(scratch):
    """usbhub, the last of the services, is no key any more; the value list of Themes leads nowhere."""
    path = make_sample(os.path.join(scratch, "SYSTEM"))
    with open(path, "r+b") as file:
        content = file.read()
        file.seek(record_of(content, b"usbhub"))
        file.write(b"xx")
        file.seek(record_of(content, b"Themes") + 40)
        file.write((0x7FFFFFF0).to_bytes(4, "little"))
    return path


def browsing(scratch):
    """One box for one cause; its neighbours are read and changed as ever"""
    with Session(damaged_sample(scratch)) as session:
        program = session.program
        session.open_key(SERVICES)
        program.keys("Right")
        last = "\\".join(session.root + SERVICES) + "\\#11"  # its name cannot be read: its place stands for it
        session.message(TITLE, f'The key "{last}" cannot be read: ROpenSubKey failed', "OK", "damaged-key")
        until(lambda: has(program.tree_cell(session.tree, session.root + SERVICES), State.EXPANDED), "the branch")
        session.picture("damaged-branch", session.main)

        session.click_key(SERVICES + ["Themes"])
        equal(session.names()[:1], ["(Default)"], "a key whose values lead nowhere")
        session.click_key(SERVICES + ["Tcpip"])
        program.double_click(session.value_cell("Start"))
        dialog = program.dialog("Edit DWORD (32-bit) Value")
        program.keys("ctrl+a", "4", "Return")
        program.gone(dialog)
        session.value_set("an edit beside the damage", SERVICES + ["Tcpip"], "Start", 4, b"\x04\0\0\0")

        # Painted again and again, it is not told again.
        session.click_key(SERVICES)
        program.keys("Left")
        until(lambda: not has(program.tree_cell(session.tree, session.root + SERVICES), State.EXPANDED), "it to close")
        program.keys("Right")
        session.click_key(SERVICES + ["Themes"])
        equal(program.open_titles(), [TITLE], "windows after opening the branch again")
        session.leave()
        session.unchanged("browsing")


run(browsing)
