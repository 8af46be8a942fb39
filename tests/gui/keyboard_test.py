# SPDX-FileCopyrightText: 2026 The tallowfen developers
# SPDX-License-Identifier: MIT
"""The session of a user without a mouse: no pointer event is ever sent."""
import os

from desktop import State, has, place, text_of, until
from session import TITLE, Session, equal, list_data, make_sample, run, step, text_data

CONTROL = ["ControlSet001", "Control"]
MADE = CONTROL + ["By keyboard"]

# Steps down in the menu of new things, type, empty data, editor, keys that fill it, stored data.
KINDS = (
    ("String", 1, 1, text_data(""), "Edit String", "typed", text_data("typed")),
    ("Binary", 2, 3, b"", "Edit Binary Value", "00ff", b"\x00\xff"),
    ("Dword", 3, 4, bytes(4), "Edit DWORD (32-bit) Value", "10", b"\x10" + bytes(3)),
    ("Qword", 4, 11, bytes(8), "Edit QWORD (64-bit) Value", "123456789a", bytes.fromhex("9a78563412000000")),
    ("Multi", 5, 7, bytes(4), "Edit Multi-String", "a\nb", list_data(["a", "b"])),
    ("Expand", 6, 2, text_data(""), "Edit String", "%OS%", text_data("%OS%")),
)


def go(session, key):
    """From the tree's first row down to a key: opens a branch with Right, steps with Down."""
    program = session.program
    path = session.root + list(key)
    until(lambda: has(session.tree, State.FOCUSED) or focus_tree(session), "the keyboard in the tree")
    # The status bar tells the current row: the very first one is current before any row is selected.
    program.keys("Home")
    until(lambda: session.status() == path[0], "the first row")
    for depth in range(1, len(path)):
        cell = program.tree_cell(session.tree, path[:depth])
        if not has(cell, State.EXPANDED):
            program.keys("Right")
            until(lambda: has(program.tree_cell(session.tree, path[:depth]), State.EXPANDED), f"{path[:depth]} open")
        wanted = "\\".join(path[: depth + 1])
        while session.status() != wanted:
            before = session.status()
            program.keys("Down")
            until(lambda: session.status() != before, "the next row")


def focus_tree(session):
    session.program.keys("Tab")
    return until(lambda: has(session.tree, State.FOCUSED) or has(session.table, State.FOCUSED), "a view") and False


def go_to_value(session, value):
    """Tab into the table, then down to the value."""
    program = session.program
    if not table_has_keyboard(session):
        program.keys("Tab")
        until(lambda: table_has_keyboard(session), "the keyboard in the table")
    program.keys("ctrl+Home")
    row = program.row_of(session.table, value)
    until(lambda: current_row(session) == 0, "the first row")
    for step_down in range(1, row + 1):
        program.keys("Down")
        until(lambda: current_row(session) == step_down, f"row {step_down}")


def table_has_keyboard(session):
    return has(session.table, State.FOCUSED) or any(
        has(session.program.table_cell(session.table, row), State.FOCUSED) for row in range(len(session.rows()))
    )


def current_row(session):
    for row in range(len(session.rows())):
        cell = session.program.table_cell(session.table, row)
        if has(cell, State.FOCUSED) or has(cell, State.SELECTED):
            return row
    return None


def pick_new(session, steps_down):
    """The menu of new things: its first item is highlighted as it opens."""
    program = session.program
    program.menu_by_keys("alt+e", "Edit")
    program.menu_by_keys("n", "Edit", "New")
    program.keys(*["Down"] * steps_down, "Return")


def answer(session, title, key):
    box = session.program.dialog(title)
    session.program.keys(key)
    session.program.gone(box)


def keys_session(session):
    """A key made, named, renamed and refused"""
    program = session.program
    go(session, CONTROL)
    pick_new(session, 0)
    equal(text_of(program.editor()), "New Key #1", "the proposed name")
    session.key_made("a new key", CONTROL + ["New Key #1"])
    program.keys("Escape")
    session.selected(CONTROL + ["New Key #1"])
    session.unchanged("Escape in the name")
    program.keys("F2")
    session.fill_editor("By keyboard")
    session.key_renamed("F2", CONTROL + ["New Key #1"], "By keyboard")
    session.selected(MADE)
    program.keys("F2")
    session.fill_editor("Session manager")
    box = program.dialog(TITLE)
    equal("The specified key name already exists." in program.labels(box), True, "the refusal")
    program.keys("Return")
    program.gone(box)
    session.unchanged("a refused rename")


def values_session(session):
    """A value of each kind made, named and edited"""
    program = session.program
    for value, steps_down, number, empty, title, typed, stored in KINDS:
        go(session, MADE)
        pick_new(session, steps_down)
        equal(text_of(program.editor()), "New Value #1", "the proposed name")
        session.value_set(f"a new {value}", MADE, "New Value #1", number, empty)
        session.fill_editor(value)
        session.value_renamed(f"naming {value}", MADE, "New Value #1", value)
        go_to_value(session, value)
        program.keys("Return")
        dialog = program.dialog(title)
        program.keys("ctrl+a")
        for i, line in enumerate(typed.split("\n")):
            if i:
                program.keys("Return")
            program.type(line)
        until(lambda: text_of(program.fields(dialog)[1]) == typed, f"{typed!r} in the field")
        if number == 7:
            program.keys("Tab")  # Return is a line of its own in the list's editor; Tab leaves it
            until(lambda: has(program.button(dialog, "OK"), State.FOCUSED), "the keyboard on Ok")
        program.keys("Return")
        program.gone(dialog)
        session.value_set(f"editing {value}", MADE, value, number, stored)
        program.keys("Return")
        dialog = program.dialog(title)
        program.keys("Escape")
        program.gone(dialog)
        session.unchanged("Escape")


def commands_in_a_name(session):
    """Refresh and Find next while a name is typed"""
    program = session.program
    go(session, MADE)
    pick_new(session, 1)
    session.value_set("a new value", MADE, "New Value #1", 1, text_data(""))
    program.type("An early name")
    until(lambda: text_of(program.editor()) == "An early name", "the name")
    program.keys("F5")
    session.value_renamed("F5 in the name", MADE, "New Value #1", "An early name")
    program.keys("ctrl+f")
    program.dialog("Find")
    program.type("tcpip")
    program.keys("Return")
    session.selected(["ControlSet001", "Services", "Tcpip"])
    program.alone(TITLE)
    until(lambda: has(session.tree, State.FOCUSED) or focus_tree(session), "the keyboard in the tree")
    program.keys("F2")
    program.type("Tcpip6")
    until(lambda: text_of(program.editor()) == "Tcpip6", "the name")
    program.keys("F3")
    session.key_renamed("F3 in the name", ["ControlSet001", "Services", "Tcpip"], "Tcpip6")
    session.selected(["ControlSet002", "Services", "Tcpip"])
    program.alone(TITLE)


def menu_key(session):
    """The Menu key opens the menu of the key or value that has the keyboard, over it"""
    program = session.program
    for go_there, row, texts in (
        (lambda: go(session, MADE), lambda: session.cell(MADE), ["New", "Delete", "Rename"]),
        (lambda: go_to_value(session, "Qword"), lambda: session.value_cell("Qword"), ["Edit", "Delete", "Rename"]),
    ):
        go_there()
        program.keys("Menu")
        menu = program.context_menu()
        equal(program.context_items(), texts, "the menu's items")
        x, y, width, height = place(row())
        until(lambda: x <= place(menu)[0] < x + width and y <= place(menu)[1] < y + height, "the menu over its row")
        program.keys("Escape")
        program.gone(menu)
    session.unchanged("a menu")


def number_base(session):
    """The base of a number switched by keyboard"""
    program = session.program
    go(session, MADE)
    go_to_value(session, "Dword")
    program.keys("Return")
    dialog = program.dialog("Edit DWORD (32-bit) Value")
    field = program.fields(dialog)[1]
    program.keys("Tab")
    until(lambda: has(program.button(dialog, "Hexadecimal"), State.FOCUSED), "the keyboard in the base")
    program.keys("Down")
    until(lambda: text_of(field) == "16", "the decimal text")
    program.keys("Return")
    program.gone(dialog)
    session.unchanged("the same number in another base")


def deleting(session):
    """Values and keys deleted: no, then yes"""
    program = session.program
    go(session, MADE)
    go_to_value(session, "Binary")
    program.keys("F2")
    session.fill_editor("Binary by keyboard")
    session.value_renamed("F2", MADE, "Binary", "Binary by keyboard")
    program.keys("Delete")
    answer(session, "Confirm Value Removal", "Escape")
    session.unchanged("Escape")
    program.keys("Delete")
    answer(session, "Confirm Value Removal", "alt+n")
    session.unchanged("No")
    program.keys("Delete")
    answer(session, "Confirm Value Removal", "alt+y")
    session.value_gone("Yes", MADE, "Binary by keyboard")
    go(session, MADE)
    program.keys("Delete")
    answer(session, "Confirm Key Removal", "alt+n")
    session.unchanged("No")
    program.keys("Delete")
    answer(session, "Confirm Key Removal", "alt+y")
    session.key_gone("Yes", MADE)


def finding(session):
    """Find, find next, the end of the search"""
    program = session.program
    program.keys("ctrl+f")
    program.dialog("Find")
    program.keys("ctrl+a")
    program.type("tcpip")
    program.keys("Return")
    for hit in (["ControlSet001", "Services", "Tcpip6"], ["ControlSet002", "Services", "Tcpip"]):
        session.selected(hit)
        program.alone(TITLE)
        program.keys("F3")
    box = program.dialog(TITLE)
    equal("Finished searching." in program.labels(box), True, "the end of the search")
    program.keys("Return")
    program.gone(box)
    program.keys("F5")
    session.unchanged("finding")


def whole_session(scratch):
    """The session with the keyboard alone"""
    with Session(make_sample(os.path.join(scratch, "SYSTEM"))) as session:
        for scene in (keys_session, values_session, commands_in_a_name, menu_key, number_base, deleting, finding):
            step(scene.__doc__)
            scene(session)
        session.program.menu_by_keys("alt+f", "File")
        session.program.keys("Return")
        session.program.ended()
        session.unchanged("the end")


run(whole_session)
